#pragma once

#include <cstdarg>
#include <cstddef>
#include <cstdio>
#include <span>

namespace Orvandeil::FileIO::detail {

// Formats as vsnprintf into `scratch` or, when the text is longer, into the block of bytes that
// grow(bytes) gives, and lets `text` point to it. Returns the length, or what vsnprintf returned
// when it failed.
template <class Grow>
int formatBounded(std::span<char> scratch, Grow grow, const char*& text, const char* format,
                  std::va_list arguments) {
    std::va_list again;
    va_copy(again, arguments);
    text = scratch.data();
    const int length = std::vsnprintf(scratch.data(), scratch.size(), format, arguments);
    if (length >= 0 && static_cast<std::size_t>(length) >= scratch.size()) {
        const std::size_t bytes = static_cast<std::size_t>(length) + 1;
        char* const block = grow(bytes);
        std::vsnprintf(block, bytes, format, again);
        text = block;
    }
    va_end(again);
    return length;
}

}  // namespace Orvandeil::FileIO::detail
