// The engine's stages for whatever processor the library is compiled for.
#define VETRA_LEVEL portable
#define VETRA_LANES "vetra/base/utils/resample/engine/lanes_portable_inl.h"
#include "vetra/base/utils/resample/engine/stages_inl.h"
