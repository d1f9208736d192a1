// The engine's stages for x86-64-v2 (SSE4.1).
#define VETRA_LEVEL v2
#define VETRA_LANES "vetra/base/utils/resample/engine/lanes_portable_inl.h"
#include "vetra/base/utils/resample/engine/stages_inl.h"
