#pragma once

#include <cstddef>
#include <cstdio>
#include <string_view>

namespace Orvandeil::FileIO::detail {

// The bytes of one field of a file, as long as they may still have to be given back. A file is used
// by one thread at a time, so nothing is locked.
class FieldText {
public:
    explicit FieldText(std::FILE* source) : file(source) {}

    int next() { return getc_unlocked(file); }

    // Reads past the six blanks of the C locale, whatever the locale in use, and returns the byte
    // behind them.
    int nextBehindBlanks() {
        int byte = next();
        while (byte == ' ' || (byte >= '\t' && byte <= '\r'))
            byte = next();
        return byte;
    }

    void keep(int byte) { bytes[length++] = static_cast<char>(byte); }

    // Nothing happens to EOF.
    void giveBack(int byte) { std::ungetc(byte, file); }

    // In reverse order, so that the file reads as before. A pipe could not seek.
    void giveBackAll() {
        while (length != 0)
            giveBack(static_cast<unsigned char>(bytes[--length]));
    }

    std::size_t size() const { return length; }
    std::string_view view() const { return {bytes, length}; }

private:
    std::FILE* file;
    std::size_t length = 0;
    char bytes[32];  // more than any field keeps
};

}  // namespace Orvandeil::FileIO::detail
