#pragma once

#include "fileio/text/tcodn_stream.h"

#include <optional>
#include <string>
#include <string_view>

namespace Orvandeil::FileIO {

namespace detail {
struct IntegerScan;
}

// Reads a text in memory: bytes of the stream's encoding, UTF-8 when none is given. It cannot be
// written to: those operations return 0 (print -1) and leave everything as it is.
//
// The scan operations skip breakable spaces and NULs. Where the text ends there, the status is 0
// and nothing else is touched; where it goes on with no number, the status is -9 and the position
// is that behind the blanks. Octal, decimal and hexadecimal integers are those of C's strtoll and
// strtoull with the limits of their types; `flag` is set by a minus sign before a value other than
// zero, and such a value beyond the range is 0. scanFloat reads the host's number syntax, and
// hexadecimal numbers as C's sscanf does.
class FILEIO_API inputStringStream : public TcodnStream {
public:
    // The caller keeps the `length` bytes alive, with a NUL byte behind them.
    inputStringStream(const char* text, long length, const std::string& encoding);
    ~inputStringStream() override;

    // The bytes read.
    int getPosition(long& position) override;
    // Returns bytes, whatever the element size.
    unsigned long GetNElements(unsigned long count, char* buffer,
                               unsigned long elementSize) override;
    unsigned long PutNElements(unsigned long count, const void* source,
                               unsigned long elementSize) override;
    int print(const char* format, std::va_list arguments) override;
    bool EndOfData() override;
    // Not beyond the beginning.
    bool Rewind(unsigned long count) override;
    void setBufferSize(unsigned long size) override;
    bool needsBufferSize() override { return false; }
    unsigned long scanOctal(long width, int& status, bool& flag) override;
    unsigned long scanHex(long width, int& status, bool& flag) override;
    unsigned long scanUnsignedInteger(long width, int& status, bool& flag) override;
    long scanInteger(long width, int& status) override;
    long scanIntegerCouldBeHex(long width, int& status) override;
    double scanFloat(long width, int& status) override;
    std::string DetectCharset(unsigned long startOffset) const override;

    // For scans in place: what is left of the text, and taking the bytes before `next`.
    std::string_view bytesToScan() const { return {current, end}; }
    void takeScanned(const char* next) { current = next; }

    // The UTF-16 units, both halves of a pair counted, that the bytes read so far decode to. Takes
    // time in proportion to them.
    virtual unsigned long getUTF16Position();

private:
    friend struct LayoutProbe;
    friend class detail::UnitsAhead;

    unsigned long countUTF16(const char* next);
    std::optional<std::string_view> numberText(long width, int& status);
    void take(std::size_t consumed, int& status);
    long scanSigned(const detail::IntegerScan& operation, long width, int& status);
    unsigned long scanUnsigned(const detail::IntegerScan& operation, long width, int& status,
                               bool& flag);
    double scanHexFloat(std::string_view text, int& status);

    const char* begin;
    const char* current;
    const char* end;
    std::string scratch;
};

}  // namespace Orvandeil::FileIO
