// The filling of grids for x86-64-v3 (AVX2).
#define VETRA_LEVEL v3
#define VETRA_LANES 8
#include "vetra/base/utils/math/densify/rows_inl.h"
