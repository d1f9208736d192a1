#include "tests/base/utils/math/arrayallocations.h"

#include <cstdlib>
#include <new>

vetra::tests::ArrayAllocations vetra::tests::goArrayAllocations;

void* operator new[](std::size_t nSize) {
    ++vetra::tests::goArrayAllocations.nCount;
    vetra::tests::goArrayAllocations.nLastSize = nSize;
    void* p = nSize > (std::size_t{1} << 30) ? nullptr : std::malloc(nSize > 0 ? nSize : 1);
    if (p == nullptr) {
        throw std::bad_alloc();
    }
    return p;
}

void operator delete[](void* p) noexcept { std::free(p); }
void operator delete[](void* p, std::size_t) noexcept { std::free(p); }
