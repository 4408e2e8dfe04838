#pragma once

#include <string>
#include <string_view>

namespace Orvandeil::FileIO {
class foutFormatPiece;
}

namespace cli {

// Places read `"%zb", column 2 of the format`, counted in characters from 1, for a format whose
// escapes are converted.

// The first malformed conversion of a format that records an error.
std::string malformedPlace(const std::u16string& format);

// The conversion of the format that a piece stands for, as it is written.
std::string pieceText(std::u16string_view format, const Orvandeil::FileIO::foutFormatPiece& piece);

// A piece of the format; empty for a literal one, and for null.
std::string piecePlace(std::u16string_view format, const Orvandeil::FileIO::foutFormatPiece* piece);

}  // namespace cli
