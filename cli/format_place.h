#pragma once

#include <cstddef>
#include <string>
#include <string_view>

namespace Orvandeil::FileIO {
class foutFormatPiece;
}

namespace cli {

// Places read `"%zb", column 2 of the format`, counted in characters from 1, for a format whose
// escapes are converted.

// The conversion that begins at unit `start`; empty behind the end.
std::string placeAt(std::u16string_view format, std::size_t start);

// The first malformed conversion of a format that records an error.
std::string malformedPlace(const std::u16string& format);
// The same for an input format, whose escapes stand as they are.
std::string malformedScanPlace(const std::u16string& format);

// The conversion of the format that a piece stands for, as it is written.
std::string pieceText(std::u16string_view format, const Orvandeil::FileIO::foutFormatPiece& piece);

// A text with its control characters and backslashes as escapes, so that it stays one line.
std::string escaped(std::u16string_view text);
// The same in quotes.
std::string quoted(std::u16string_view text);

// A piece of the format; empty for a literal one, and for null.
std::string piecePlace(std::u16string_view format, const Orvandeil::FileIO::foutFormatPiece* piece);

}  // namespace cli
