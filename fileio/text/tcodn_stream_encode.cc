#include "fileio/constants.h"
#include "fileio/host/text.h"
#include "fileio/text/direct_transcoding.h"
#include "fileio/text/tcodn_stream.h"

#include <algorithm>

namespace Orvandeil::FileIO {
namespace {

// Units given to one converter call.
constexpr std::size_t sliceUnits = constants::converterPieceBytes / sizeof(char16_t);

#ifdef FILEIO_FAST_PATHS
// Units encoded at once without the converter, and given to it where that is not possible.
constexpr std::size_t directUnits = constants::transferPieceBytes / 64;
constexpr std::size_t smallestConversion = 64;
#endif

// Room beyond one byte a unit: more than any single character with its escape sequences takes.
constexpr std::size_t spareBytes = 32;

}  // namespace

#ifdef FILEIO_FAST_PATHS
// Moves `text` and the bytes `used` of writeBytes behind what needs no converter.
void TcodnStream::encodeDirectly(const char16_t*& text, const char16_t* textEnd,
                                 std::size_t& used) {
    UErrorCode status = U_ZERO_ERROR;
    if (ucnv_fromUCountPending(converter, &status) != 0) return;
    detail::Progress progress{};
    std::size_t units = 0;
    do {
        units = std::min(static_cast<std::size_t>(textEnd - text), directUnits);
        const std::size_t room = detail::roomToEncode(units);
        if (writeBytes.size() - used < room) writeBytes.resize(used + room);
        progress = detail::encodeDirectly(directForm, tableOfConverter(), text, units,
                                          writeBytes.data() + used);
        text += progress.taken;
        used += progress.made;
    } while (progress.taken == units && text != textEnd);
}
#endif

// Most text takes a byte or little more a unit; what does not fit goes on in a larger block.
// Returns the bytes put into writeBytes.
unsigned long TcodnStream::encode(const char16_t* text, unsigned long n, UErrorCode& status) {
    const char16_t* const textEnd = text + n;
    std::size_t used = 0;
    do {
        std::size_t slice = sliceUnits;
#ifdef FILEIO_FAST_PATHS
        if (directForm != detail::DirectForm::None && status != U_BUFFER_OVERFLOW_ERROR) {
            encodeDirectly(text, textEnd, used);
            if (text == textEnd) return used;
            slice = std::min(slice, smallestConversion);
        }
#endif
        const std::size_t units = std::min(static_cast<std::size_t>(textEnd - text), slice);
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
