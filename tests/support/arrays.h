#pragma once

#include "embedded/services/array.h"

#include <cstddef>
#include <string>

namespace support {

// "1 -2.5": as many elements of a class as `count`.
std::string listed(vxClassID classID, const void* values, std::size_t count);

// "int8 2x3: 1 2 3 4 5 6", in column-major order, and the imaginary parts behind " + i "; the texts
// of a string array stand between quotes. "none" for null.
std::string shown(const vxArray* array);
inline std::string shown(const Orvandeil::FileIO::embedded::ArrayPtr& array) {
    return shown(array.get());
}

}  // namespace support
