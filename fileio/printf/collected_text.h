#pragma once

#include "fileio/text/ascii_output.h"

#include <array>
#include <cstddef>
#include <span>
#include <string_view>

namespace Orvandeil::FileIO {

struct foutFormatPieceInitBlock;
class printfArgumentSource;

namespace detail {

struct NumberForm;

// A fast path of the output driver: what the pieces of a short format print to a string of UTF-16,
// worked out without the pieces, collected, and put there together. A string's block grows at the
// piece that needs it, so that nothing collected can fail to be written.
class CollectedText {
public:
    using Blocks = std::span<const foutFormatPieceInitBlock>;

    // Whether a format is short, and has no other pieces than literals and conversions of numbers
    // with width and precision of their own. Making its pieces takes no memory.
    static bool suits(Blocks format);

    explicit CollectedText(TcodnStream& out);
    CollectedText(const CollectedText&) = delete;
    CollectedText& operator=(const CollectedText&) = delete;
    ~CollectedText() { flush(); }

    // Whether the stream is such a string.
    bool isUsable() const { return string != nullptr; }

    // Collects what the piece prints, and steps past its argument. False, and nothing is done, when
    // only the piece itself can print it. Passes on what the host raises.
    bool take(const foutFormatPieceInitBlock& piece, printfArgumentSource& source);

private:
    bool takeLiteral(std::u16string_view text);
    bool takeNumber(const foutFormatPieceInitBlock& piece, printfArgumentSource& source);
    template <class T>
    bool takeAs(const NumberForm& form, printfArgumentSource& source);
    void keep(const char* newEnd);
    void flush();
    std::size_t room() const { return static_cast<std::size_t>(block.end() - end); }

    outputStringStream* string;  // null for any other stream
    AsciiOutput output;
    std::size_t unitsInString = 0;  // that its block has room for, as far as was asked
    std::array<char, 1024> block;
    char* end = block.data();
};

}  // namespace detail
}  // namespace Orvandeil::FileIO
