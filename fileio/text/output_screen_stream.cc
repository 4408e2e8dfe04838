#include "fileio/text/output_screen_stream.h"

#include "fileio/host/memory.h"
#include "fileio/text/piecewise_format.h"

#include <algorithm>
#include <cstring>
#include <string>

namespace Orvandeil::FileIO {

outputScreenStream::outputScreenStream(std::FILE* standardFile, FilePermission& openedWith)
    : screenStreamBase(standardFile, openedWith), console(vxConsoleOutput()) {}

outputScreenStream::~outputScreenStream() = default;

// A promise about what is coming, never a size to allocate.
void outputScreenStream::setBufferSize(unsigned long size) {
    bufferSize = size;
}

void outputScreenStream::countWritten(std::size_t bytes, std::size_t positions) {
    bytesWritten += bytes;
    fileStream::bytesWritten += positions;
}

int outputScreenStream::print(const char* format, std::va_list arguments) {
    return printCommon(format, arguments);
}

int outputScreenStream::printCommon(const char* format, std::va_list arguments) {
    bool refused = false;
    // The console's text ends at a NUL, in whatever piece that is.
    const auto put = [&refused](const char* text, std::size_t count) {
        refused = vxConsolePutString(std::string(text, count).c_str()) == -1;
        return !refused && std::memchr(text, '\0', count) == nullptr;
    };
    std::string block;
    const int length = detail::formatPiecewise(put, block, format, arguments);
    if (length < 0) return length;
    if (refused) return 0;
    const auto count = static_cast<std::size_t>(length);
    countWritten(count, count);
    return length;
}

int outputScreenStream::putFormatted(const char* text, std::size_t count) {
    if (vxConsolePutString(text) == -1) return 0;
    countWritten(count, count);
    return static_cast<int>(count);
}

unsigned long outputScreenStream::PutNElements(unsigned long count, const void* buffer,
                                               unsigned long elementSize) {
    return PutNElementsCommon(count, buffer, elementSize);
}

// Runs between the NUL bytes. Each NUL is replaced by a write of nothing.
unsigned long outputScreenStream::PutNElementsCommon(unsigned long count, const void* buffer,
                                                     unsigned long elementSize) {
    std::size_t total = 0;
    if (__builtin_mul_overflow(count, elementSize, &total)) vxMemoryRaiseExhausted();
    const char* next = static_cast<const char*>(buffer);
    for (std::size_t left = total; left != 0;) {
        const std::size_t run = strnlen(next, left);
        if (run != 0) vxConsoleWriteBytes(next, run);
        next += run;
        left -= run;
        if (left == 0) break;
        vxConsoleWriteBytes("", 0);
        ++next;
        --left;
    }
    countWritten(total, total);
    return total;
}

unsigned long outputScreenStream::PutNCharacters(unsigned long n, const char16_t* text) {
    return PutNCharactersCommon(n, text, *console);
}

unsigned long outputScreenStream::PutNCharactersCommon(unsigned long n, const char16_t* text,
                                                       vxConsoleSink& sink) {
    if (n == 0) return 0;
    std::u16string shown(text, n);
    std::replace(shown.begin(), shown.end(), u'\0', u' ');
    vxConsoleWriteText(sink, shown.data(), n);
    countWritten(2 * n, n);
    return n;
}

int outputScreenStream::flush() {
    vxConsoleFlush(*console);
    return vxConsoleIsBad(*console) ? 0 : 1;
}

}  // namespace Orvandeil::FileIO
