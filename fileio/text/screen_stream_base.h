#pragma once

#include "fileio/streams/file_stream.h"

namespace Orvandeil::FileIO {

// Base of the console streams. They are built on a standard file, but their text goes to the
// host's console: as UTF-16, without conversion. Everything that makes no sense on a console
// raises "KESTRA:legacy_two_part:notimplemented_vx".
class FILEIO_API screenStreamBase : public fileStream {
public:
    screenStreamBase(std::FILE* standardFile, FilePermission& openedWith);
    ~screenStreamBase() override;

    using fileStream::getFileSize;
    using fileStream::GetNElements;

    // Stores -1 and succeeds.
    int getPosition(long& position) override;
    // Refused: -1.
    int setPosition(long position) override;
    bool EndOfData() override;
    bool needsBufferSize() override;
    bool isFileOpen() const override;
    bool isScreen() const override;
    void clearError() override;

    unsigned long GetNElements(unsigned long count, char* buffer,
                               unsigned long elementSize) override;
    unsigned long PutNElements(unsigned long count, const void* buffer,
                               unsigned long elementSize) override;
    int print(const char* format, std::va_list arguments) override;
    bool Rewind(unsigned long count) override;
    void setBufferSize(unsigned long size) override;
    unsigned long scanOctal(long width, int& status, bool& flag) override;
    unsigned long scanHex(long width, int& status, bool& flag) override;
    unsigned long scanUnsignedInteger(long width, int& status, bool& flag) override;
    long scanInteger(long width, int& status) override;
    long scanIntegerCouldBeHex(long width, int& status) override;
    double scanFloat(long width, int& status) override;
    bool getFileSize(long& size) override;
    int flush() override;
    virtual int getByte();
};

}  // namespace Orvandeil::FileIO
