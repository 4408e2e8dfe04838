#pragma once

#include "embedded/builtins/open_file.h"

#include <optional>
#include <string>

namespace Orvandeil::FileIO::embedded {

struct Line {
    std::u16string text;
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
