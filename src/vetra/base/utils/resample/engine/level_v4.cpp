// The engine's stages for x86-64-v4 (AVX-512).
#define VETRA_LEVEL v4
#define VETRA_LANES "vetra/base/utils/resample/engine/lanes_avx512_inl.h"
#include "vetra/base/utils/resample/engine/stages_inl.h"
