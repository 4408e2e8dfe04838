#pragma once

#include "fileio/buffers/convert_element.h"
#include "fileio/buffers/vx_data.h"

#include <cmath>
#include <limits>
#include <type_traits>
#include <utility>

namespace Orvandeil::FileIO::detail {

// Whether `value` is, exactly, a value of the integer type Target.
template <class Target, class Source>
bool isRepresentable(Source value) {
    if constexpr (std::is_floating_point_v<Source>) {
        // Both bounds are powers of two or zero, so they are exact; the upper one is exclusive.
        constexpr Source lowest = static_cast<Source>(std::numeric_limits<Target>::min());
        constexpr Source half = static_cast<Source>(std::numeric_limits<Target>::max() / 2 + 1);
        return value >= lowest && value < 2 * half && value == std::trunc(value);
    } else {
        return std::in_range<Target>(value);
    }
}

// Whether an element of a numeric, char or logical array is, exactly, a value of Target. Char and
// logical count as unsigned integers.
template <class Target>
bool isRepresentable(const VxData& data, std::size_t index) {
    switch (data.getClassID()) {
#define FILEIO_TEST_ELEMENT(classID, Type) \
    case classID:                          \
        return isRepresentable<Target>(toNumber(loadElement<Type>(data.getElements(), index)));
        FILEIO_FOR_EACH_ELEMENT(FILEIO_TEST_ELEMENT)
#undef FILEIO_TEST_ELEMENT
        default:
            return false;
    }
}

// Whether an element is Inf or NaN; only double and single elements can be.
inline bool isNonFinite(const VxData& data, std::size_t index) {
    switch (data.getClassID()) {
        case vxDOUBLE_CLASS:
            return !std::isfinite(loadElement<double>(data.getElements(), index));
        case vxSINGLE_CLASS:
            return !std::isfinite(loadElement<float>(data.getElements(), index));
        default:
            return false;
    }
}

}  // namespace Orvandeil::FileIO::detail
