// The passes of the Fourier transforms for x86-64-v4 (AVX-512).
#define VETRA_LEVEL v4
#define VETRA_LANES 16
#include "vetra/base/utils/math/fourier/passes_inl.h"
