#pragma once

#include "fileio/scanf/fin_format_parser.h"
#include "fileio/text/ascii_set.h"

#include <cstddef>
#include <cstdint>
#include <string_view>
#include <vector>

namespace Orvandeil::FileIO::detail {

struct DecimalInteger;
struct FieldBytes;

// A fast path of the scan driver: a format of decimal conversions without a width, of words, sets
// and characters, and of ASCII text, run over the bytes of a stream in place. For any other format
// or stream, all runs are empty.
class ScanProgram {
public:
    ScanProgram(finFormatParser& parser, TcodnStream& input);

    struct Run {
        std::size_t values = 0;  // stored: a number, a word and a run of characters alike
        std::size_t elements = 0;
        std::size_t pieces = 0;  // run with success
        std::size_t nextPiece;   // up to the number of pieces
        bool recycled = false;
    };
    // Elements of the result's class, 2 bytes each when that is char and else 8.
    struct Room {
        char* next;
        std::size_t elements;
    };
    // Goes on with piece `nextPiece` and stores at most `wanted` values. It ends behind a
    // conversion: literals that no plain field follows, and a field that is not plain, not all
    // there or too long for the room, are left for the pieces themselves.
    Run run(std::size_t nextPiece, std::size_t wanted, Room room) const;

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
            Double,
            Word,
            Set,
            Characters
        };
        Kind kind;
        bool isStored = false;
        char character = 0;  // of Character
        std::size_t endOfPiece = 0;
        std::size_t width = 0;  // of the last three
        std::size_t set = 0;    // theirs, by number

        bool isLiteral() const { return kind <= Character; }
        bool isText() const { return kind >= Word; }
    };

    bool addPieces(finFormatParser& parser);
    bool addLiteral(std::u16string_view text);
    bool addNumber(const finFormatPiece& piece);
    bool addText(const finFormatPiece& piece);
    const Step* stepOfPiece(std::size_t piece) const;
    template <class Stream>
    Run runOn(Stream& stream, std::size_t nextPiece, std::size_t wanted, Room room) const;
    bool takeLiteral(const Step& step, FieldBytes& bytes) const;
    template <class Numbers>
    bool takeNumber(const Step& step, FieldBytes& bytes, Room& room) const;
    template <class Numbers>
    bool parseNumber(Step::Kind kind, FieldBytes& bytes, std::uint64_t& bits) const;
    std::size_t takeText(const Step& step, FieldBytes& bytes, Room& room) const;
    void storeText(const char* text, std::size_t length, std::size_t readable, Room& room) const;
    std::uint64_t bitsOf(Step::Kind kind, const DecimalInteger& number) const;
    template <class T>
    std::uint64_t stored(T value) const;

    TcodnStream* input;
    Source source = Source::None;
    bool storesUnits;
    bool storesDoubles;
    bool hasText = false;  // which the stream would decode
    std::vector<Step> steps;
    std::vector<std::size_t> firstSteps;  // of the pieces
    std::vector<AsciiSet> sets;
};

}  // namespace Orvandeil::FileIO::detail
