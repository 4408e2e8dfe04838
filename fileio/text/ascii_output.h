#pragma once

#include <cstddef>

namespace Orvandeil::FileIO {

class TcodnStream;
class fileStream;
class outputStringStream;

namespace detail {

// Writes blocks of ASCII to a stream in one go, where that leaves everything as many small writes
// would: the bytes, the counters, the growth of a string's block, the moments at which a file's
// buffer is written out.
class AsciiOutput {
public:
    // Whether the stream is one that this is true of: a string stream of UTF-16 or of an encoding
    // that keeps ASCII, or a file behind a buffer larger than any block. Decides the encoding of a
    // string stream.
    static bool suits(TcodnStream& out);

    // Decides the encoding of a string stream, too: nothing may have been written so far.
    explicit AsciiOutput(TcodnStream& out);

    // Whether text is encoded as its ASCII bytes; what print() writes always is.
    bool keepsAscii() const;

    // Whether UTF-16 units are written as they are.
    bool keepsUnits() const { return unitBytes == sizeof(char16_t); }

    // Writes the block, and returns the bytes that went out: fewer after a failure, which is in
    // the stream's error code. Nothing of them is counted then. Passes on what the host raises when
    // a string's block cannot grow; nothing is written then.
    std::size_t write(const char* text, std::size_t count);

    // The place for so many units more of a string's block, which then count as written; null, and
    // nothing is done, when it has to grow for them.
    char16_t* takeUnits(std::size_t count);

    // The bytes that still fit into a string's block.
    std::size_t room() const;

    // Counts, for a file, or writes, for a string, the first `count` bytes of a block of which no
    // more went out.
    void settle(const char* text, std::size_t count);

private:
    outputStringStream* string;
    fileStream* file;
    std::size_t unitBytes;
};

}  // namespace detail
}  // namespace Orvandeil::FileIO
