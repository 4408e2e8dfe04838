#pragma once

#include "fileio/text/direct_transcoding.h"

#include <cstddef>

namespace Orvandeil::FileIO::detail {

// Decodes UTF-8 in windows of twelve bytes, whatever mixture of one, two and three bytes the
// characters have. Stops before a window that is not all such, and near the end of either text.
// Nothing is made where the processor lacks the instructions.
Progress decodeMixedUtf8(const char* bytes, std::size_t count, char16_t* out, std::size_t room);

// The same, up to a line feed or carriage return.
Progress decodeMixedUtf8Line(const char* bytes, std::size_t count, char16_t* out, std::size_t room);

// Encodes eight units at a time. Stops before eight with a surrogate among them, and near the end
// of the text. The room is roomToEncode of the units.
Progress encodeMixedUtf8(const char16_t* text, std::size_t units, char* out);

}  // namespace Orvandeil::FileIO::detail
