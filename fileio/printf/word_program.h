#pragma once

#include "fileio/printf/fout_format_piece.h"
#include "fileio/printf/printf_argument_source.h"
#include "fileio/text/output_string_stream.h"

#include <span>
#include <string_view>
#include <vector>

namespace Orvandeil::FileIO::detail {

// A format of one "%s" without width and precision, and text around it, that goes to a string of
// UTF-16: whole char arrays are copied there one after the other.
class WordProgram {
public:
    using Pieces = std::span<foutFormatPiece* const>;

    WordProgram(Pieces formatPieces, TcodnStream& out);

    // Whether the program can print this format to this stream.
    bool isUsable() const { return string != nullptr; }

    // Prints a pass for each argument that is a char array, from the current one on, less the last
    // argument. `current` is the piece being printed.
    void run(printfArgumentSource& source, foutFormatPiece*& current) const;

private:
    bool compile();
    void put(std::u16string_view text) const;
    void copyPass(std::u16string_view word, char16_t* out) const;

    Pieces pieces;
    std::vector<std::u16string_view> literals;  // by piece; empty for the conversion
    std::size_t literalUnits = 0;
    outputStringStream* string;
};

}  // namespace Orvandeil::FileIO::detail
