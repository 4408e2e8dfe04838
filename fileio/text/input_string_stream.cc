#include "fileio/text/input_string_stream.h"

#include "fileio/constants.h"
#include "fileio/text/owned_converter.h"

#include <algorithm>
#include <cstdint>
#include <cstring>

namespace Orvandeil::FileIO {
namespace {

// Decodes the next piece only to count its units. The text's last piece is its flush.
unsigned long countUnits(UConverter* converter, const char*& next, const char* end) {
    char16_t units[1024];
    unsigned long total = 0;
    const char* const pieceEnd =
        next + std::min(static_cast<std::size_t>(end - next), constants::converterPieceBytes);
    UErrorCode status = U_ZERO_ERROR;
    do {
        status = U_ZERO_ERROR;
        char16_t* target = units;
        ucnv_toUnicode(converter, &target, std::end(units), &next, pieceEnd, nullptr,
                       pieceEnd == end, &status);
        total += static_cast<unsigned long>(target - units);
    } while (status == U_BUFFER_OVERFLOW_ERROR);
    next = pieceEnd;
    return total;
}

#ifdef FILEIO_FAST_PATHS
const char* findNonAscii(const char* next, const char* end) {
    constexpr std::uint64_t highBits = 0x8080808080808080;
    for (std::uint64_t block; end - next >= long{sizeof block}; next += sizeof block) {
        std::memcpy(&block, next, sizeof block);
        if ((block & highBits) != 0) break;
    }
    return std::find_if(next, end, [](char byte) { return (byte & 0x80) != 0; });
}
#endif

}  // namespace

inputStringStream::inputStringStream(const char* text, long length, const std::string& encoding)
    : TcodnStream(encoding), begin(text), current(text), end(text + length) {}

inputStringStream::~inputStringStream() = default;

int inputStringStream::getPosition(long& position) {
    position = current - begin;
    return 0;
}

unsigned long inputStringStream::GetNElements(unsigned long count, char* buffer,
                                              unsigned long elementSize) {
    const auto left = static_cast<unsigned long>(end - current);
    unsigned long bytes = 0;
    if (__builtin_mul_overflow(count, elementSize, &bytes)) bytes = left;
    bytes = std::min(bytes, left);
    if (bytes != 0) std::memcpy(buffer, current, bytes);
    current += bytes;
    return bytes;
}

unsigned long inputStringStream::PutNElements(unsigned long, const void*, unsigned long) {
    return 0;
}

int inputStringStream::print(const char*, std::va_list) {
    return -1;
}

bool inputStringStream::EndOfData() {
    return current == end;
}

bool inputStringStream::Rewind(unsigned long count) {
    current -= std::min(count, static_cast<unsigned long>(current - begin));
    return true;
}

void inputStringStream::setBufferSize(unsigned long) {}

std::string inputStringStream::DetectCharset(unsigned long) const {
    return "UTF-8";
}

unsigned long inputStringStream::getUTF16Position() {
    const char* next = begin;
#ifdef FILEIO_FAST_PATHS
    if (readsAsciiAsIs() && DetectCharset(0) == "UTF-8") next = findNonAscii(begin, current);
#endif
    const auto ascii = static_cast<unsigned long>(next - begin);
    return next == current ? ascii : ascii + countUTF16(next);
}

// The units from `next` on, with which a character begins.
unsigned long inputStringStream::countUTF16(const char* next) {
    // A converter of its own: what the reading one holds back belongs to the next read.
    UErrorCode status = U_ZERO_ERROR;
    const detail::OwnedConverter counter(ucnv_clone(GetConv(0), &status));
    if (U_FAILURE(status)) {
        CheckStatus(status);
        return 0;
    }
    ucnv_resetToUnicode(counter.get());
    unsigned long total = 0;
    while (next != current) {
        total += countUnits(counter.get(), next, current);
    }
    return total;
}

}  // namespace Orvandeil::FileIO
