#pragma once

#include <cstdarg>
#include <cstddef>
#include <functional>
#include <string>

namespace Orvandeil::FileIO::detail {

// Takes a run of bytes of a formatted text; false ends the formatting.
using TakePiece = std::function<bool(const char* bytes, std::size_t count)>;

// Formats as vprintf does. A text of ordinary length goes to `take` at once, a longer one in pieces
// that fit `block`, so that a width of gigabytes needs no memory of its own. Returns the length,
// or what the C library returned when it failed. What `take` throws passes on.
int formatPiecewise(const TakePiece& take, std::string& block, const char* format,
                    std::va_list arguments);

}  // namespace Orvandeil::FileIO::detail
