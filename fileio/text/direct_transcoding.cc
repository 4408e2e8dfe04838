#include "fileio/text/direct_transcoding.h"

#include "fileio/text/mixed_utf8.h"

#include <algorithm>
#include <bit>
#include <cstdint>
#include <cstring>
#include <string_view>

#ifdef __SSE2__
#include <emmintrin.h>
#endif
#include <unicode/utf16.h>

namespace Orvandeil::FileIO::detail {
namespace {

#ifdef __SSE2__
constexpr std::size_t blockUnits = 16;

__m128i loadBlock(const void* place) {
    return _mm_loadu_si128(static_cast<const __m128i*>(place));
}
void storeBlock(void* place, __m128i block) {
    _mm_storeu_si128(static_cast<__m128i*>(place), block);
}

// A bit for each of sixteen bytes of which `limit` is greater, taken as signed.
unsigned bytesBelow(const char* bytes, char limit) {
    const __m128i below = _mm_cmplt_epi8(loadBlock(bytes), _mm_set1_epi8(limit));
    return static_cast<unsigned>(_mm_movemask_epi8(below));
}
#endif

Progress progress(std::ptrdiff_t taken, std::ptrdiff_t made) {
    return {static_cast<std::size_t>(taken), static_cast<std::size_t>(made)};
}

// Widens as many whole blocks as are all ASCII, and returns their bytes. There must be room for all
// bytes.
std::size_t widenAsciiBlocks(const char* bytes, std::size_t count, char16_t* out) {
    std::size_t i = 0;
#ifdef __SSE2__
    for (; count - i >= blockUnits; i += blockUnits) {
        const __m128i block = loadBlock(bytes + i);
        if (_mm_movemask_epi8(block) != 0) break;
        storeBlock(out + i, _mm_unpacklo_epi8(block, _mm_setzero_si128()));
        storeBlock(out + i + blockUnits / 2, _mm_unpackhi_epi8(block, _mm_setzero_si128()));
    }
#endif
    static_cast<void>(bytes), static_cast<void>(count), static_cast<void>(out);
    return i;
}

// Narrows as many whole blocks as are below 0x80 or 0x100, and returns their units.
template <char16_t limit>
std::size_t narrowBlocks(const char16_t* text, std::size_t count, char* out) {
    std::size_t i = 0;
#ifdef __SSE2__
    const __m128i mask = _mm_set1_epi16(static_cast<short>(~(limit - 1)));
    for (; count - i >= blockUnits; i += blockUnits) {
        const __m128i low = loadBlock(text + i);
        const __m128i high = loadBlock(text + i + blockUnits / 2);
        const __m128i excess = _mm_and_si128(_mm_or_si128(low, high), mask);
        if (_mm_movemask_epi8(_mm_cmpeq_epi16(excess, _mm_setzero_si128())) != 0xFFFF) break;
        storeBlock(out + i, _mm_packus_epi16(low, high));
    }
#endif
    static_cast<void>(text), static_cast<void>(count), static_cast<void>(out);
    return i;
}

// Narrows the leading units below the limit, and returns their number.
template <char16_t limit>
std::size_t narrowUnits(const char16_t* text, std::size_t count, char* out) {
    std::size_t i = narrowBlocks<limit>(text, count, out);
    for (; i < count && text[i] < limit; ++i)
        out[i] = static_cast<char>(text[i]);
    return i;
}

Progress widenLatin1(const char* bytes, std::size_t count, char16_t* out) {
    for (std::size_t i = 0; i < count; ++i)
        out[i] = static_cast<unsigned char>(bytes[i]);
    return {count, count};
}

// Goes on unit by unit for so long when a block is not all ASCII.
constexpr std::ptrdiff_t mixedRun = 16;

Progress decodeUtf8(const char* bytes, std::size_t count, char16_t* out, std::size_t room) {
    const char* next = bytes;
    const char* const end = bytes + count;
    char16_t* target = out;
    const char16_t* const targetEnd = out + room;
    while (next != end && target != targetEnd) {
        const Progress mixed = decodeMixedUtf8(next, static_cast<std::size_t>(end - next), target,
                                               static_cast<std::size_t>(targetEnd - target));
        next += mixed.taken;
        target += mixed.made;
        const auto most = static_cast<std::size_t>(std::min(end - next, targetEnd - target));
        const std::size_t ascii = widenAsciiBlocks(next, most, target);
        next += ascii;
        target += ascii;
        const char* const mixedEnd = next + std::min(end - next, mixedRun);
        while (next != end && target != targetEnd) {
            const bool isAscii = static_cast<signed char>(*next) >= 0;
            if (isAscii && next >= mixedEnd) break;
            std::size_t length = 1;
            *target = static_cast<unsigned char>(*next);
            if (!isAscii) length = decodeUtf8Character(next, end, *target);
            if (length == 0) return progress(next - bytes, target - out);
            next += length;
            ++target;
        }
    }
    return progress(next - bytes, target - out);
}

// A character of any length without a branch, which mixed text would make the processor mistake.
// Writes a byte too many. `unit` is no surrogate.
char* encodeCharacter(unsigned unit, char* target) {
    const unsigned isLong = 0U - static_cast<unsigned>(unit >= 0x80);
    const unsigned isLongest = 0U - static_cast<unsigned>(unit >= 0x800);
    const unsigned last = 0x80 | (unit & 0x3F);
    const unsigned two = 0xC0 | unit >> 6 | last << 8;
    const unsigned three = 0xE0 | unit >> 12 | (0x80 | (unit >> 6 & 0x3F)) << 8 | last << 16;
    unsigned bytes = (unit & ~isLong) | (two & isLong & ~isLongest) | (three & isLongest);
    if (std::endian::native == std::endian::big) bytes = __builtin_bswap32(bytes);
    std::memcpy(target, &bytes, sizeof bytes);
    return target + 1 - static_cast<int>(isLong) - static_cast<int>(isLongest);
}

Progress encodeUtf8(const char16_t* text, std::size_t units, char* out) {
    const char16_t* next = text;
    const char16_t* const end = text + units;
    char* target = out;
    while (next != end) {
        const Progress mixed = encodeMixedUtf8(next, static_cast<std::size_t>(end - next), target);
        next += mixed.taken;
        target += mixed.made;
        const std::size_t ascii =
            narrowBlocks<0x80>(next, static_cast<std::size_t>(end - next), target);
        next += ascii;
        target += ascii;
        const char16_t* const mixedEnd = next + std::min(end - next, mixedRun);
        for (; next != mixedEnd; ++next) {
            if (U16_IS_SURROGATE(*next)) return progress(next - text, target - out);
            target = encodeCharacter(*next, target);
        }
    }
    return progress(next - text, target - out);
}

// Which side of a copy of UTF-16 units has the bytes of the other order, if any.
enum class Swap { Nothing, Source, Target };

template <Swap swap>
std::uint16_t unitAt(const char* source, std::size_t i) {
    std::uint16_t unit;
    std::memcpy(&unit, source + 2 * i, sizeof unit);
    return swap == Swap::Source ? __builtin_bswap16(unit) : unit;
}

template <Swap swap>
void storeUnit(char* target, std::size_t i, std::uint16_t unit) {
    if (swap == Swap::Target) unit = __builtin_bswap16(unit);
    std::memcpy(target + 2 * i, &unit, sizeof unit);
}

// Copies the units before the first surrogate, and returns their number.
template <Swap swap>
std::size_t copyUnits(const char* __restrict source, std::size_t count, char* __restrict target) {
    constexpr std::size_t block = 32;  // of which the compiler makes vectors
    std::size_t i = 0;
    for (; count - i >= block; i += block) {
        std::uint16_t surrogates = 0;
        for (std::size_t j = i; j < i + block; ++j) {
            const std::uint16_t unit = unitAt<swap>(source, j);
            surrogates |= static_cast<std::uint16_t>((unit & 0xF800) == 0xD800);
            storeUnit<swap>(target, j, unit);
        }
        if (surrogates != 0) break;
    }
    for (; i < count && !U16_IS_SURROGATE(unitAt<swap>(source, i)); ++i)
        storeUnit<swap>(target, i, unitAt<swap>(source, i));
    return i;
}

constexpr bool isNative(DirectForm form) {
    return (form == DirectForm::Utf16LE) == (std::endian::native == std::endian::little);
}

Progress decodeUtf16(bool native, const char* bytes, std::size_t units, char16_t* out) {
    auto* const target = reinterpret_cast<char*>(out);
    const std::size_t made = native ? copyUnits<Swap::Nothing>(bytes, units, target)
                                    : copyUnits<Swap::Source>(bytes, units, target);
    return {2 * made, made};
}

Progress encodeUtf16(bool native, const char16_t* text, std::size_t units, char* out) {
    const auto* const source = reinterpret_cast<const char*>(text);
    const std::size_t taken = native ? copyUnits<Swap::Nothing>(source, units, out)
                                     : copyUnits<Swap::Target>(source, units, out);
    return {taken, 2 * taken};
}

// So many characters of one or two bytes are decoded without a branch between them, which mixed
// text would make the processor mistake.
constexpr std::size_t tableRun = 8;

// Decodes whole runs, as far as the table has all their characters.
Progress decodeRunsByTable(const ByteTable& table, const char* bytes, std::size_t count,
                           char16_t* out, std::size_t room) {
    std::size_t taken = 0;
    std::size_t made = 0;
    while (count - taken > 2 * tableRun && room - made >= tableRun) {
        const char* const next = bytes + taken;
        unsigned leads = 0;
        for (unsigned i = 0; i < 2 * tableRun; ++i)
            leads |= table.isLead(static_cast<unsigned char>(next[i])) << i;
        unsigned missing = 0;
        unsigned place = 0;
        for (std::size_t i = 0; i < tableRun; ++i) {
            const unsigned two = leads >> place & 1;
            const char16_t unit = table.unitAt(static_cast<unsigned char>(next[place]),
                                               static_cast<unsigned char>(next[place + 1]), two);
            missing |= static_cast<unsigned>(unit == ByteTable::noUnit);
            out[made + i] = unit;
            place += 1 + two;
        }
        if (missing != 0) break;
        taken += place;
        made += tableRun;
    }
    return {taken, made};
}

Progress decodeByTable(const ByteTable& table, const char* bytes, std::size_t count, char16_t* out,
                       std::size_t room) {
    std::size_t taken = 0;
    std::size_t made = 0;
    while (taken < count && made < room) {
        const std::size_t most = std::min(count - taken, room - made);
        const std::size_t ascii =
            table.isAsciiTransparent() ? widenAsciiBlocks(bytes + taken, most, out + made) : 0;
        taken += ascii;
        made += ascii;
        const Progress run =
            decodeRunsByTable(table, bytes + taken, count - taken, out + made, room - made);
        taken += run.taken;
        made += run.made;
        if (taken == count || made == room) break;
        const auto lead = static_cast<unsigned char>(bytes[taken]);
        char16_t unit = table.unitOf(lead);
        std::size_t length = 1;
        if (unit == ByteTable::noUnit && count - taken >= 2) {
            unit = table.unitOf(lead, static_cast<unsigned char>(bytes[taken + 1]));
            length = 2;
        }
        if (unit == ByteTable::noUnit) break;
        out[made++] = unit;
        taken += length;
    }
    return {taken, made};
}

Progress encodeByTable(const ByteTable& table, const char16_t* text, std::size_t units, char* out) {
    char* target = out;
    std::size_t i = table.isAsciiTransparent() ? narrowBlocks<0x80>(text, units, out) : 0;
    target += i;
    for (; i < units; ++i) {
        const unsigned bytes = table.bytesOf(text[i]);
        if (bytes == ByteTable::noBytes) break;
        const unsigned two = bytes > 0xFF;
        // Two bytes are swapped, and one byte is followed by a byte too many.
        target[0] = static_cast<char>(bytes >> 8 * two);
        target[1] = static_cast<char>(bytes);
        target += 1 + two;
    }
    return progress(static_cast<std::ptrdiff_t>(i), target - out);
}

}  // namespace

DirectForm directFormOf(const UConverter* converter) {
    switch (ucnv_getType(converter)) {
        case UCNV_US_ASCII:
            return DirectForm::Ascii;
        case UCNV_LATIN_1:
            return DirectForm::Latin1;
        case UCNV_UTF8:
            return DirectForm::Utf8;
        case UCNV_SBCS:
        case UCNV_DBCS:
        case UCNV_MBCS:
            return DirectForm::Table;
        default:
            break;
    }
    // Variants that look for a byte order mark have names of their own.
    UErrorCode status = U_ZERO_ERROR;
    const char* const name = ucnv_getName(converter, &status);
    const std::string_view known = U_SUCCESS(status) && name ? name : "";
    if (known == "UTF-16LE") return DirectForm::Utf16LE;
    return known == "UTF-16BE" ? DirectForm::Utf16BE : DirectForm::None;
}

std::size_t widenAscii(const char* bytes, std::size_t count, char16_t* out) {
    std::size_t i = widenAsciiBlocks(bytes, count, out);
    for (; i < count && static_cast<unsigned char>(bytes[i]) < 0x80; ++i)
        out[i] = static_cast<unsigned char>(bytes[i]);
    return i;
}

std::size_t asciiWithoutNul(const char* bytes, std::size_t count) {
    std::size_t i = 0;
#ifdef __SSE2__
    for (; count - i >= blockUnits; i += blockUnits) {
        const unsigned others = bytesBelow(bytes + i, 1);
        if (others != 0) return i + static_cast<std::size_t>(std::countr_zero(others));
    }
#endif
    while (i<count&& static_cast<signed char>(bytes[i])> 0)
        ++i;
    return i;
}

Progress decodeDirectly(DirectForm form, const ByteTable* table, const char* bytes,
                        std::size_t count, char16_t* out, std::size_t room) {
    const std::size_t most = std::min(count, room);
    switch (form) {
        case DirectForm::Ascii: {
            const std::size_t ascii = widenAscii(bytes, most, out);
            return {ascii, ascii};
        }
        case DirectForm::Latin1:
            return widenLatin1(bytes, most, out);
        case DirectForm::Utf8:
            return decodeUtf8(bytes, count, out, room);
        case DirectForm::Utf16LE:
        case DirectForm::Utf16BE:
            return decodeUtf16(isNative(form), bytes, std::min(count / 2, room), out);
        case DirectForm::Table:
            return decodeByTable(*table, bytes, count, out, room);
        case DirectForm::None:
            break;
    }
    return {0, 0};
}

Progress encodeDirectly(DirectForm form, const ByteTable* table, const char16_t* text,
                        std::size_t units, char* out) {
    switch (form) {
        case DirectForm::Ascii: {
            const std::size_t ascii = narrowUnits<0x80>(text, units, out);
            return {ascii, ascii};
        }
        case DirectForm::Latin1: {
            const std::size_t latin = narrowUnits<0x100>(text, units, out);
            return {latin, latin};
        }
        case DirectForm::Utf8:
            return encodeUtf8(text, units, out);
        case DirectForm::Utf16LE:
        case DirectForm::Utf16BE:
            return encodeUtf16(isNative(form), text, units, out);
        case DirectForm::Table:
            return encodeByTable(*table, text, units, out);
        case DirectForm::None:
            break;
    }
    return {0, 0};
}

}  // namespace Orvandeil::FileIO::detail
