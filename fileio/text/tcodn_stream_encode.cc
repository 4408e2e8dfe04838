#include "fileio/constants.h"
#include "fileio/host/text.h"
#include "fileio/text/tcodn_stream.h"

#include <algorithm>

namespace Orvandeil::FileIO {
namespace {

// Units given to one converter call.
constexpr std::size_t sliceUnits = constants::converterPieceBytes / sizeof(char16_t);

// Room beyond one byte a unit: more than any single character with its escape sequences takes.
constexpr std::size_t spareBytes = 32;

}  // namespace

// Most text takes a byte or little more a unit; what does not fit goes on in a larger block.
// Returns the bytes put into writeBytes.
unsigned long TcodnStream::encode(const char16_t* text, unsigned long n, UErrorCode& status) {
    const char16_t* const textEnd = text + n;
    std::size_t used = 0;
    do {
        const std::size_t units = std::min(static_cast<std::size_t>(textEnd - text), sliceUnits);
        const std::size_t room = units + spareBytes;
        if (writeBytes.size() - used < room) writeBytes.resize(used + room);
        char* target = writeBytes.data() + used;
        status = U_ZERO_ERROR;
        ucnv_fromUnicode(converter, &target, target + room, &text, text + units, nullptr, false,
                         &status);
        used = static_cast<std::size_t>(target - writeBytes.data());
    } while (status == U_BUFFER_OVERFLOW_ERROR || (U_SUCCESS(status) && text != textEnd));
    return used;
}

unsigned long TcodnStream::PutString(const char16_t* text, unsigned long n) {
    if (!text || n == 0) return 0;
    if (writesUnits()) return PutNCharacters(n, text);
    const UConverter* const to = GetConv(0);
    UErrorCode status = U_ZERO_ERROR;
    const unsigned long bytes = encode(text, n, status);
    const unsigned long written = PutNElements(bytes, writeBytes.data(), 1);
    CheckStatus(status);
    const auto size = static_cast<unsigned long>(ucnv_getMinCharSize(to));
    if (ucnv_getMaxCharSize(to) == ucnv_getMinCharSize(to)) return written / size;
    return written == bytes ? n : 0;
}

unsigned long TcodnStream::PutNCharacters(unsigned long n, const char16_t* text) {
    return PutNElements(n, text, sizeof(char16_t));
}

int TcodnStream::PutASCIIString(const char* text, int n) {
    const auto count = static_cast<std::size_t>(std::max(n, 0));
    if (asciiText.size() < count) asciiText.resize(count);
    const bool ascii = vxTextWidenAscii(text, count, asciiText.data());
    return static_cast<int>(PutString(asciiText.data(), ascii ? count : 0));
}

}  // namespace Orvandeil::FileIO
