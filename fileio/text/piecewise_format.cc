#include "fileio/text/piecewise_format.h"

#include "fileio/constants.h"
#include "fileio/host/memory.h"

#include <cstdio>
#include <exception>
#include <memory>

#include <sys/types.h>

namespace Orvandeil::FileIO::detail {
namespace {

struct Cookie {
    const TakePiece& take;
    bool ended;  // closing the file offers again what was refused
    std::exception_ptr raised;
};

// The C library is no place for an exception to pass through.
ssize_t writePiece(void* place, const char* bytes, std::size_t count) {
    Cookie& cookie = *static_cast<Cookie*>(place);
    try {
        cookie.ended = cookie.ended || !cookie.take(bytes, count);
    } catch (...) {
        cookie.ended = true;
        cookie.raised = std::current_exception();
    }
    return cookie.ended ? 0 : static_cast<ssize_t>(count);
}

int closeFile(std::FILE* file) {
    return std::fclose(file);
}

void formatLong(const TakePiece& take, std::string& block, const char* format,
                std::va_list arguments) {
    block.resize(constants::formatPieceBytes);
    Cookie cookie = {take, false, nullptr};
    std::unique_ptr<std::FILE, int (*)(std::FILE*)> file(
        fopencookie(&cookie, "w", {nullptr, writePiece, nullptr, nullptr}), closeFile);
    if (!file) vxMemoryRaiseExhausted();
    std::setvbuf(file.get(), block.data(), _IOFBF, block.size());
    std::vfprintf(file.get(), format, arguments);
    file.reset();
    if (cookie.raised) std::rethrow_exception(cookie.raised);
}

}  // namespace

int formatPiecewise(const TakePiece& take, std::string& block, const char* format,
                    std::va_list arguments) {
    char scratch[constants::numberScratchBytes];
    std::va_list again;
    va_copy(again, arguments);
    const int length = std::vsnprintf(scratch, sizeof scratch, format, arguments);
    const auto count = static_cast<std::size_t>(length);
    // An exception leaves the copied list behind, for which va_end has nothing to do.
    if (length >= 0 && count < sizeof scratch) take(scratch, count);
    if (length >= 0 && count >= sizeof scratch) formatLong(take, block, format, again);
    va_end(again);
    return length;
}

}  // namespace Orvandeil::FileIO::detail
