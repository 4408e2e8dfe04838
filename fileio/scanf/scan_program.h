#pragma once

#include "fileio/scanf/fin_format_parser.h"

#include <cstddef>
#include <cstdint>
#include <string_view>
#include <vector>

namespace Orvandeil::FileIO::detail {

struct DecimalInteger;
struct FieldBytes;

// A fast path of the scan driver: a format of decimal conversions without a width and of ASCII
// text, run over the bytes of a stream in place. For any other format or stream, all runs are
// empty.
class ScanProgram {
public:
    ScanProgram(finFormatParser& parser, TcodnStream& input);

    struct Run {
        std::size_t values = 0;  // stored
        std::size_t pieces = 0;  // run with success
        std::size_t nextPiece;   // up to the number of pieces
        bool recycled = false;
    };
    // Goes on with piece `nextPiece` and stores at most `room` elements of the result's class, 8
    // bytes each, at `out`. It ends behind a number: text that no plain number follows, and a
    // number that is not plain or not all there, are left for the pieces themselves.
    Run run(std::size_t nextPiece, char* out, std::size_t room) const;

private:
    enum class Source { None, File, Text };
    struct Step {
        enum Kind : unsigned char {
            Blanks,
            Character,
            Short,
            Int,
            Long,
            UnsignedShort,
            UnsignedInt,
            UnsignedLong,
            Single,
            Double
        };
        Kind kind;
        bool isStored = false;
        char character = 0;  // of Character
        std::size_t endOfPiece = 0;
    };

    bool addPieces(finFormatParser& parser);
    bool addLiteral(std::u16string_view text);
    bool addNumber(const finFormatPiece& piece);
    const Step* stepOfPiece(std::size_t piece) const;
    template <class Stream>
    Run runOn(Stream& stream, std::size_t nextPiece, char* out, std::size_t room) const;
    template <class Numbers>
    bool takeNumber(Step::Kind kind, FieldBytes& bytes, std::uint64_t& bits) const;
    std::uint64_t bitsOf(Step::Kind kind, const DecimalInteger& number) const;
    template <class T>
    std::uint64_t stored(T value) const;

    TcodnStream* input;
    Source source = Source::None;
    bool storesDoubles;
    bool hasText = false;  // which the stream would decode
    std::vector<Step> steps;
    std::vector<std::size_t> firstSteps;  // of the pieces
};

}  // namespace Orvandeil::FileIO::detail
