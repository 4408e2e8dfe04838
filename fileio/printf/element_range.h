#pragma once

#include "fileio/buffers/vx_data.h"

#include <cmath>
#include <cstdint>
#include <cstring>
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

template <class Source>
Source loadElement(const VxData& data, std::size_t index) {
    Source value;
    std::memcpy(&value, static_cast<const char*>(data.getElements()) + index * sizeof value,
                sizeof value);
    return value;
}

// Whether an element of a numeric, char or logical array is, exactly, a value of Target. Char and
// logical count as unsigned integers.
template <class Target>
bool isRepresentable(const VxData& data, std::size_t index) {
    switch (data.getClassID()) {
        case vxDOUBLE_CLASS:
            return isRepresentable<Target>(loadElement<double>(data, index));
        case vxSINGLE_CLASS:
            return isRepresentable<Target>(loadElement<float>(data, index));
        case vxINT8_CLASS:
            return isRepresentable<Target>(loadElement<std::int8_t>(data, index));
        case vxINT16_CLASS:
            return isRepresentable<Target>(loadElement<std::int16_t>(data, index));
        case vxINT32_CLASS:
            return isRepresentable<Target>(loadElement<std::int32_t>(data, index));
        case vxINT64_CLASS:
            return isRepresentable<Target>(loadElement<std::int64_t>(data, index));
        case vxUINT32_CLASS:
            return isRepresentable<Target>(loadElement<std::uint32_t>(data, index));
        case vxUINT64_CLASS:
            return isRepresentable<Target>(loadElement<std::uint64_t>(data, index));
        case vxLOGICAL_CLASS:
        case vxCHAR_CLASS:
        case vxUINT8_CLASS:
        case vxUINT16_CLASS:
            return true;
        default:
            return false;
    }
}

// Whether an element is Inf or NaN; only double and single elements can be.
inline bool isNonFinite(const VxData& data, std::size_t index) {
    switch (data.getClassID()) {
        case vxDOUBLE_CLASS:
            return !std::isfinite(loadElement<double>(data, index));
        case vxSINGLE_CLASS:
            return !std::isfinite(loadElement<float>(data, index));
        default:
            return false;
    }
}

}  // namespace Orvandeil::FileIO::detail
