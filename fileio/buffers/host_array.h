#pragma once

#include "fileio/host/arrays.h"

#include <cstddef>
#include <functional>
#include <memory>
#include <numeric>

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

// The number of elements of a host array that is no object: the product of its lengths.
inline std::size_t elementCount(const vxArray* array) {
    const std::size_t* lengths = vxArrayDimensions(array);
    return std::accumulate(lengths, lengths + vxArrayDimensionCount(array), std::size_t{1},
                           std::multiplies<>());
}

}  // namespace Orvandeil::FileIO::detail
