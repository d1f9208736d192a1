// The filling of grids for x86-64-v4 (AVX-512).
#define VETRA_LEVEL v4
#define VETRA_LANES 16
#include "vetra/base/utils/math/densify/rows_inl.h"
