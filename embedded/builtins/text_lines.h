#pragma once

#include "embedded/builtins/open_file.h"
#include "fileio/buffers/host_block.h"

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>

namespace Orvandeil::FileIO::embedded {

struct Line {
    // Until the line is read into again.
    std::u16string_view text() const {
        if (!block) return usualText;
        return {reinterpret_cast<const char16_t*>(block.get()), blockUnits};
    }

    std::u16string usualText;
    detail::HostBytes block;  // of a longer text, in its place
    std::size_t blockUnits = 0;
    int result = 0;  // 1: ended by one line feed or carriage return, 2: by both, 0: otherwise
    // What cut the line short, or lost what stands behind it.
    std::optional<Failure> failure = std::nullopt;
};

enum class Terminators { Dropped, Kept };

inline constexpr long anyLength = -1;

// The next line of at most `maxCharacters` code points; nothing at the end of the file. CodeError
// -5 for a file not open for reading, else the stream's error.
std::optional<Line> readLine(OpenFile& file, long maxCharacters = anyLength,
                             Terminators terminators = Terminators::Dropped);

// The same into a line that was read before, whose memory serves again; false for nothing, which
// leaves an empty line.
bool readLine(OpenFile& file, Line& line, long maxCharacters, Terminators terminators);

}  // namespace Orvandeil::FileIO::embedded
