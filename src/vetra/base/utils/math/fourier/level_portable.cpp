// The passes of the Fourier transforms for whatever processor the library is compiled for.
#define VETRA_LEVEL portable
#define VETRA_LANES 4
#include "vetra/base/utils/math/fourier/passes_inl.h"
