#pragma once

#include "fileio/host/console.h"
#include "fileio/text/screen_stream_base.h"

#include <cstddef>

#include <boost/shared_ptr.hpp>

namespace Orvandeil::FileIO {

// Writes to the host's console output. Two counters run: bytes written, and in the fileStream part
// a position that counts a UTF-16 unit as one.
class FILEIO_API outputScreenStream : public screenStreamBase {
public:
    outputScreenStream(std::FILE* standardFile, FilePermission& openedWith);
    ~outputScreenStream() override;

    // Bytes in the host's narrow encoding; NUL bytes are dropped, but counted. Returns the bytes.
    unsigned long PutNElements(unsigned long count, const void* buffer,
                               unsigned long elementSize) override;
    // Returns the characters formatted: 0 when the console refuses them, negative as vprintf.
    int print(const char* format, std::va_list arguments) override;
    void setBufferSize(unsigned long size) override;
    // U+0000 is written as a blank. Returns `n`.
    unsigned long PutNCharacters(unsigned long n, const char16_t* text) override;
    // 1 unless the console's bad bit is set: on a console success is not 0.
    int flush() override;
    virtual int printCommon(const char* format, std::va_list arguments);

    // What print() does with a text that is formatted already and ends at its first NUL.
    int putFormatted(const char* text, std::size_t count);

    std::size_t getConsoleBytesWritten() const { return bytesWritten; }

protected:
    unsigned long PutNElementsCommon(unsigned long count, const void* buffer,
                                     unsigned long elementSize);
    unsigned long PutNCharactersCommon(unsigned long n, const char16_t* text, vxConsoleSink& sink);

private:
    friend struct LayoutProbe;

    void countWritten(std::size_t bytes, std::size_t positions);

    std::size_t bufferSize = 0;
    std::size_t bytesWritten = 0;
    boost::shared_ptr<vxConsoleSink> console;
};

}  // namespace Orvandeil::FileIO
