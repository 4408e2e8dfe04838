#pragma once

#include "fileio/constants.h"
#include "fileio/printf/fout_format_piece.h"
#include "fileio/printf/number_text.h"
#include "fileio/printf/printf_argument_source.h"
#include "fileio/text/ascii_output.h"

#include <array>
#include <span>
#include <string>
#include <vector>

namespace Orvandeil::FileIO::detail {

// The pieces of a sequential format without "*", prepared for running over the elements of one
// argument without asking anything again for each of them. It prints what the pieces would print.
class ElementProgram {
public:
    using Pieces = std::span<foutFormatPiece* const>;

    // The first pass of the format is over, so that the stream's encoding is decided.
    ElementProgram(Pieces formatPieces, TcodnStream& out);

    // Whether the program can print this format to this stream.
    bool isUsable() const { return usable; }

    // Prints as many whole passes as the current argument has elements for, less the last one:
    // that, and with it the step to the next argument, is left to the pieces. Where a write fails,
    // `current` is the piece that failed. Throws and passes on what the piece would.
    void run(printfArgumentSource& source, foutFormatPiece*& current);

private:
    enum Kind : int { Signed, Unsigned, Real, Character };

    // A conversion and the text behind it; behind the last one, that in front of the first too.
    struct Step {
        Kind kind;
        NumberForm form;
        NumberForm exponent;  // for what the conversion cannot hold
        std::string behind;
        std::size_t mostBytes;
        std::size_t pieceIndex;
    };
    // A place between two pieces: the next of each.
    struct Place {
        std::size_t piece;
        std::size_t element;
    };

    bool compile();
    bool addConversion(const foutFormatPiece& piece, std::size_t index);
    bool addLiteral(std::u16string_view text);
    template <class Element>
    void runAs(printfArgumentSource& source, vxClassID asClass, std::size_t count);
    template <class Element>
    static char* writeElement(char* out, const Step& step, Element value);
    void printByPiece(const Step& step, printfArgumentSource& source, std::size_t element);
    std::size_t room(const char* out) const;
    char* flush(const char* end, Place next);
    void settlePart(std::size_t written);
    std::size_t bytesOfPiece(Place place) const;

    Pieces pieces;
    TcodnStream& stream;
    AsciiOutput output;
    std::vector<Step> steps;
    std::string front;
    PlainElements elements;
    Place blockBegin = {0, 0};
    std::size_t failedPiece = 0;
    std::size_t stepped = 0;  // the elements that the source has gone past
    bool usable;
    std::array<char, constants::elementBlockBytes> block;
};

}  // namespace Orvandeil::FileIO::detail
