#pragma once

#include "fileio/text/tcodn_stream.h"

#include <string>

namespace Orvandeil::FileIO {

// Collects everything written to it in one block of host memory, which it hands over at the end.
// Without an encoding it stores UTF-16 code units in native byte order. It cannot be read from:
// those operations return 0 and leave everything as it is.
class FILEIO_API outputStringStream : public TcodnStream {
public:
    explicit outputStringStream(const std::string& encoding);
    ~outputStringStream() override;

    // The bytes written.
    int getPosition(long& position) override;
    unsigned long GetNElements(unsigned long count, char* buffer,
                               unsigned long elementSize) override;
    unsigned long PutNElements(unsigned long count, const void* source,
                               unsigned long elementSize) override;
    int print(const char* format, std::va_list arguments) override;
    bool EndOfData() override;
    // Forgets the last `count` bytes, which must have been written.
    bool Rewind(unsigned long count) override;
    void setBufferSize(unsigned long size) override;
    bool needsBufferSize() override { return true; }
    unsigned long scanOctal(long width, int& status, bool& flag) override;
    unsigned long scanHex(long width, int& status, bool& flag) override;
    unsigned long scanUnsignedInteger(long width, int& status, bool& flag) override;
    long scanInteger(long width, int& status) override;
    long scanIntegerCouldBeHex(long width, int& status) override;
    double scanFloat(long width, int& status) override;
    std::string DetectCharset(unsigned long startOffset) const override;

    // Forgets the block without freeing it.
    virtual void Reset();

    // The block, cut to the bytes written; the caller owns it and frees it with the host's
    // allocator. Null when nothing was written. The stream is empty afterwards.
    void* transferBuffer();

    // Room for `need` more bytes: a block that must grow reaches at least its present capacity
    // plus the need, by doubling.
    void EnsureSpace(unsigned long need);
    void ResizeTo(unsigned long newCapacity);

private:
    friend struct LayoutProbe;
    friend class detail::AsciiOutput;

    char* data = nullptr;
    unsigned long capacity = 0;
    char* cursor = nullptr;
    unsigned long bufferSize = 0;
    char* mark = nullptr;  // a second position that only has to stay in range
    std::string printScratch;
};

}  // namespace Orvandeil::FileIO
