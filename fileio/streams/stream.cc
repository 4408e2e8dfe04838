#include "fileio/streams/stream.h"

namespace Orvandeil::FileIO {

stream::~stream() = default;

int stream::printf(const char* format, ...) {
    std::va_list arguments;
    va_start(arguments, format);
    const int result = print(format, arguments);
    va_end(arguments);
    return result;
}

}  // namespace Orvandeil::FileIO
