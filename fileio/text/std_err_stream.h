#pragma once

#include "fileio/text/output_screen_stream.h"

namespace Orvandeil::FileIO {

// Writes to the host's console error.
class FILEIO_API stdErrStream : public outputScreenStream {
public:
    stdErrStream(std::FILE* standardFile, FilePermission& openedWith);
    ~stdErrStream() override;

    // Through the console's output, redirected to its error for the duration of the call.
    unsigned long PutNElements(unsigned long count, const void* buffer,
                               unsigned long elementSize) override;
    int print(const char* format, std::va_list arguments) override;
    unsigned long PutNCharacters(unsigned long n, const char16_t* text) override;
    int flush() override;

private:
    friend struct LayoutProbe;

    boost::shared_ptr<vxConsoleSink> errorConsole;
};

}  // namespace Orvandeil::FileIO
