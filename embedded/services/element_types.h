#pragma once

#include "fileio/host/arrays.h"

#include <cstdint>

namespace Orvandeil::FileIO::embedded {

template <class T>
struct ElementType {};

// Calls `known` with the ElementType of a class, or `unknown` for one without plain elements.
template <class Known, class Unknown>
auto withElementType(vxClassID classID, Known known, Unknown unknown) {
    switch (classID) {
        case vxLOGICAL_CLASS:
        case vxUINT8_CLASS:
            return known(ElementType<std::uint8_t>());
        case vxCHAR_CLASS:
        case vxUINT16_CLASS:
            return known(ElementType<std::uint16_t>());
        case vxDOUBLE_CLASS:
            return known(ElementType<double>());
        case vxSINGLE_CLASS:
            return known(ElementType<float>());
        case vxINT8_CLASS:
            return known(ElementType<std::int8_t>());
        case vxINT16_CLASS:
            return known(ElementType<std::int16_t>());
        case vxINT32_CLASS:
            return known(ElementType<std::int32_t>());
        case vxUINT32_CLASS:
            return known(ElementType<std::uint32_t>());
        case vxINT64_CLASS:
            return known(ElementType<std::int64_t>());
        case vxUINT64_CLASS:
            return known(ElementType<std::uint64_t>());
        default:
            return unknown();
    }
}

}  // namespace Orvandeil::FileIO::embedded
