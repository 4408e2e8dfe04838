#include "fileio/text/ascii_output.h"

#include "fileio/constants.h"
#include "fileio/text/known_streams.h"

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <cstring>
#include <stdio_ext.h>
#include <utility>

#ifdef __SSE2__
#include <emmintrin.h>
#endif

namespace Orvandeil::FileIO::detail {
namespace {

bool isBlockBuffered(std::FILE* file) {
    return __flbf(file) == 0 && __fbufsize(file) > constants::elementBlockBytes;
}

void widenAscii(const char* text, std::size_t count, char* out) {
    std::size_t i = 0;
#ifdef __SSE2__
    for (; i + 16 <= count; i += 16) {
        const __m128i bytes = _mm_loadu_si128(reinterpret_cast<const __m128i*>(text + i));
        const __m128i zero = _mm_setzero_si128();
        auto* const units = reinterpret_cast<__m128i*>(out + 2 * i);
        _mm_storeu_si128(units, _mm_unpacklo_epi8(bytes, zero));
        _mm_storeu_si128(units + 1, _mm_unpackhi_epi8(bytes, zero));
    }
#endif
    for (; i < count; ++i) {
        const auto unit = static_cast<char16_t>(text[i]);
        std::memcpy(out + 2 * i, &unit, sizeof unit);
    }
}

// Half a pair that waits in the converter goes out before anything else.
bool holdsUnits(const UConverter* converter) {
    UErrorCode ignored = U_ZERO_ERROR;
    return ucnv_fromUCountPending(converter, &ignored) != 0;
}

}  // namespace

bool AsciiOutput::suits(TcodnStream& out) {
    if (exactly<outputStringStream>(out) != nullptr) {
        return out.writesUnits() || (out.asciiTransparent && !holdsUnits(out.converter));
    }
    const fileStream* const file = exactly<fileStream>(out);
    return file != nullptr && isBlockBuffered(file->file);
}

AsciiOutput::AsciiOutput(TcodnStream& out)
    : string(exactly<outputStringStream>(out)),
      file(string != nullptr ? nullptr : exactly<fileStream>(out)),
      unitBytes(string != nullptr && out.writesUnits() ? sizeof(char16_t) : 1) {}

bool AsciiOutput::keepsAscii() const {
    return string != nullptr || file->asciiTransparent;
}

std::size_t AsciiOutput::room() const {
    if (string == nullptr) return 0;
    return (string->capacity - static_cast<std::size_t>(string->cursor - string->data)) / unitBytes;
}

char16_t* AsciiOutput::takeUnits(std::size_t count) {
    if (room() < count) return nullptr;
    return reinterpret_cast<char16_t*>(
        std::exchange(string->cursor, string->cursor + count * sizeof(char16_t)));
}

std::size_t AsciiOutput::write(const char* text, std::size_t count) {
    if (string != nullptr) {
        // As often as small writes would make it grow, none of which is larger than the block.
        while (room() < count) {
            const unsigned long grown = 2 * string->capacity;
            string->ResizeTo(grown != 0 ? grown : constants::firstOutputBlockBytes);
        }
        settle(text, count);
        return count;
    }
    errno = 0;
    const std::size_t written = std::fwrite(text, 1, count, file->file);
    if (written == count) {
        file->bytesWritten += count;
    } else {
        file->recordFailure();
    }
    return written;
}

void AsciiOutput::settle(const char* text, std::size_t count) {
    if (string == nullptr) {
        file->bytesWritten += count;
        return;
    }
    if (unitBytes == 1) {
        std::copy_n(text, count, string->cursor);
    } else {
        widenAscii(text, count, string->cursor);
    }
    string->cursor += count * unitBytes;
}

}  // namespace Orvandeil::FileIO::detail
