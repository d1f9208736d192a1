#ifndef VETRA_TESTS_BASE_UTILS_MATH_ARRAYALLOCATIONS_H
#define VETRA_TESTS_BASE_UTILS_MATH_ARRAYALLOCATIONS_H

#include <cstddef>

namespace vetra::tests {

/// What array new was asked for in this program. Requests above 1 GiB are refused, so that sizes of
/// any number of bits can be looked at.
struct ArrayAllocations {
    std::size_t nCount = 0;
    std::size_t nLastSize = 0;
};

extern ArrayAllocations goArrayAllocations;

}  // namespace vetra::tests

#endif  // VETRA_TESTS_BASE_UTILS_MATH_ARRAYALLOCATIONS_H
