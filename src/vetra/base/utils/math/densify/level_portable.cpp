// The filling of grids for any processor.
#define VETRA_LEVEL portable
#define VETRA_LANES 4
#include "vetra/base/utils/math/densify/rows_inl.h"
