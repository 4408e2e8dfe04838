#pragma once

#include "fileio/host/arrays.h"
#include "fileio/host/memory.h"

#include <algorithm>
#include <cstddef>
#include <memory>
#include <span>

namespace Orvandeil::FileIO::detail {

struct ArrayDestroyer {
    void operator()(vxArray* array) const noexcept { vxArrayDestroy(array); }
};

// A host array that ends with its scope, unless it is handed on.
using OwnedArray = std::unique_ptr<vxArray, ArrayDestroyer>;

// Whether the class is one of numbers: floating or integer, not char and not logical.
constexpr bool isNumericClass(vxClassID classID) {
    return classID >= vxDOUBLE_CLASS && classID <= vxUINT64_CLASS;
}

// The product of dimensions: 0 as soon as one of them is. Beyond 64 bits it is the host's
// out-of-memory error.
inline std::size_t elementCount(std::span<const std::size_t> lengths) {
    if (std::ranges::find(lengths, 0U) != lengths.end()) return 0;
    std::size_t count = 1;
    for (const std::size_t length : lengths) {
        if (__builtin_mul_overflow(count, length, &count)) vxMemoryRaiseExhausted();
    }
    return count;
}

// The number of elements of a host array that is no object.
inline std::size_t elementCount(const vxArray* array) {
    return elementCount({vxArrayDimensions(array), vxArrayDimensionCount(array)});
}

}  // namespace Orvandeil::FileIO::detail
