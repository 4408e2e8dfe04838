#include "fileio/text/std_err_stream.h"

namespace Orvandeil::FileIO {
namespace {

// The console's output goes to its error for as long as this lives.
class OutputOntoError {
public:
    explicit OutputOntoError(const boost::shared_ptr<vxConsoleSink>& error) {
        vxConsoleRedirectionPush(error);
    }
    // Undone also when the call fails; an exception in here ends the process.
    ~OutputOntoError() {
        vxConsoleFlush(*vxConsoleOutput());
        vxConsoleRedirectionPop();
    }
    OutputOntoError(const OutputOntoError&) = delete;
    OutputOntoError& operator=(const OutputOntoError&) = delete;
};

}  // namespace

stdErrStream::stdErrStream(std::FILE* standardFile, FilePermission& openedWith)
    : outputScreenStream(standardFile, openedWith), errorConsole(vxConsoleError()) {}

stdErrStream::~stdErrStream() = default;

unsigned long stdErrStream::PutNElements(unsigned long count, const void* buffer,
                                         unsigned long elementSize) {
    const OutputOntoError redirection(errorConsole);
    return PutNElementsCommon(count, buffer, elementSize);
}

int stdErrStream::print(const char* format, std::va_list arguments) {
    const OutputOntoError redirection(errorConsole);
    return outputScreenStream::print(format, arguments);
}

unsigned long stdErrStream::PutNCharacters(unsigned long n, const char16_t* text) {
    return PutNCharactersCommon(n, text, *errorConsole);
}

int stdErrStream::flush() {
    vxConsoleFlush(*errorConsole);
    return vxConsoleIsBad(*errorConsole) ? 0 : 1;
}

}  // namespace Orvandeil::FileIO
