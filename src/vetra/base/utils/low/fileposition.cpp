#include "vetra/base/utils/low/fileposition.h"

#include <sys/types.h>

// On a 32-bit system _FILE_OFFSET_BITS=64 makes it so.
static_assert(sizeof(off_t) == sizeof(long long));

int FSeek(std::FILE* file, long long offset, int origin) { return fseeko(file, offset, origin); }

long long FTell(std::FILE* file) { return ftello(file); }
