// The engine's stages for x86-64-v3 (AVX2).
#define VETRA_LEVEL v3
#define VETRA_LANES "vetra/base/utils/resample/engine/lanes_avx2_inl.h"
#include "vetra/base/utils/resample/engine/stages_inl.h"
