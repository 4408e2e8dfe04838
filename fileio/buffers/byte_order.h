#pragma once

#include "fileio/export.h"

#include <cstddef>

namespace Orvandeil::FileIO::detail {

// Reverses the bytes of each of `count` elements of `elementBytes` bytes (1, 2, 4 or 8), in place.
// The block need not be aligned.
FILEIO_API void flipElements(void* elements, std::size_t elementBytes, std::size_t count);

}  // namespace Orvandeil::FileIO::detail
