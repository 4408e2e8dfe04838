#include "fileio/buffers/vector_unit.h"
#include "fileio/text/mixed_utf8.h"

#ifdef FILEIO_VECTOR_UNITS

#include <array>
#include <bit>
#include <cstdint>
#include <tmmintrin.h>

namespace Orvandeil::FileIO::detail {
namespace {

constexpr std::size_t windowBytes = 12;
constexpr std::size_t loadedBytes = 16;

// Six characters of one or two bytes come before four of one to three.
constexpr int shortCharacters = 6;
constexpr int longCharacters = 4;
constexpr unsigned shortShuffles = 64;  // 2^6
constexpr unsigned longShuffles = 81;   // 3^4
constexpr unsigned noShuffle = shortShuffles + longShuffles;

struct Window {
    std::uint8_t shuffle;
    std::uint8_t bytes;
};
struct Tables {
    // By the bytes that end a character, as bits.
    std::array<Window, 1 << windowBytes> windows{};
    // For each character the last byte lowest, zero (0x80) above its first one.
    alignas(16) std::array<std::array<std::uint8_t, loadedBytes>, noShuffle> shuffles{};
};

// Describes the window in characters of at most `longest` bytes; false when it has too few.
consteval bool describe(Tables& tables, unsigned ends, int characters, unsigned longest) {
    const unsigned laneBytes = longest == 2 ? 2 : 4;
    std::array<std::uint8_t, loadedBytes> shuffle{};
    shuffle.fill(0x80);
    unsigned index = 0;
    unsigned begin = 0;
    for (unsigned lane = 0; lane < static_cast<unsigned>(characters); ++lane) {
        unsigned last = begin;
        while (last < windowBytes && (ends >> last & 1) == 0)
            ++last;
        const unsigned length = last + 1 - begin;
        if (last == windowBytes || length > longest) return false;
        for (unsigned i = 0; i < length; ++i)
            shuffle[lane * laneBytes + i] = static_cast<std::uint8_t>(last - i);
        index = index * longest + length - 1;
        begin = last + 1;
    }
    if (longest == 3) index += shortShuffles;
    tables.shuffles[index] = shuffle;
    tables.windows[ends] = {static_cast<std::uint8_t>(index), static_cast<std::uint8_t>(begin)};
    return true;
}

consteval Tables makeTables() {
    Tables tables;
    for (unsigned ends = 0; ends < tables.windows.size(); ++ends) {
        if (!describe(tables, ends, shortCharacters, 2) &&
            !describe(tables, ends, longCharacters, 3)) {
            tables.windows[ends] = {noShuffle, 0};
        }
    }
    return tables;
}

constexpr Tables tables = makeTables();

FILEIO_FOR_SSSE3 __m128i load(const void* place) {
    return _mm_loadu_si128(static_cast<const __m128i*>(place));
}

FILEIO_FOR_SSSE3 bool isAllSet(__m128i mask) {
    return _mm_movemask_epi8(mask) == 0xFFFF;
}

// Lanes of 16 bits: an ASCII character, or a lead from 0xC2 to 0xDF over its trail. Leads without
// trails and trails without leads are in neither range.
FILEIO_FOR_SSSE3 bool storeShort(__m128i lanes, char16_t* out) {
    const __m128i ascii =
        _mm_cmpeq_epi16(_mm_and_si128(lanes, _mm_set1_epi16(-0x80)), _mm_setzero_si128());
    const __m128i pairs =
        _mm_and_si128(_mm_cmpgt_epi16(lanes, _mm_set1_epi16(static_cast<short>(0xC27F))),
                      _mm_cmplt_epi16(lanes, _mm_set1_epi16(static_cast<short>(0xE000))));
    const __m128i low = _mm_and_si128(lanes, _mm_set1_epi16(0x7F));
    const __m128i high = _mm_srli_epi16(_mm_and_si128(lanes, _mm_set1_epi16(0x1F00)), 2);
    _mm_storeu_si128(reinterpret_cast<__m128i*>(out), _mm_or_si128(low, high));
    return isAllSet(_mm_or_si128(ascii, pairs));
}

FILEIO_FOR_SSSE3 __m128i isBetween(__m128i lanes, int above, int below) {
    return _mm_and_si128(_mm_cmpgt_epi32(lanes, _mm_set1_epi32(above)),
                         _mm_cmplt_epi32(lanes, _mm_set1_epi32(below)));
}

// Lanes of 32 bits, with leads from 0xE0 to 0xEF in addition, but neither overlong forms nor
// surrogates.
FILEIO_FOR_SSSE3 bool storeLong(__m128i lanes, char16_t* out) {
    const __m128i low = _mm_and_si128(lanes, _mm_set1_epi32(0x7F));
    const __m128i middle = _mm_srli_epi32(_mm_and_si128(lanes, _mm_set1_epi32(0x3F00)), 2);
    const __m128i high = _mm_srli_epi32(_mm_and_si128(lanes, _mm_set1_epi32(0xF0000)), 4);
    const __m128i units = _mm_or_si128(_mm_or_si128(low, middle), high);
    const __m128i lowHalves =
        _mm_setr_epi8(0, 1, 4, 5, 8, 9, 12, 13, -1, -1, -1, -1, -1, -1, -1, -1);
    _mm_storel_epi64(reinterpret_cast<__m128i*>(out), _mm_shuffle_epi8(units, lowHalves));
    const __m128i triples = _mm_andnot_si128(
        isBetween(units, 0xD7FF, 0xE000),
        _mm_and_si128(isBetween(lanes, 0xDFFFFF, 0xF00000), isBetween(units, 0x7FF, 0x10000)));
    const __m128i shorter =
        _mm_or_si128(isBetween(lanes, -1, 0x80), isBetween(lanes, 0xC27F, 0xE000));
    return isAllSet(_mm_or_si128(shorter, triples));
}

FILEIO_FOR_SSSE3 void widen(__m128i block, char16_t* out) {
    auto* const target = reinterpret_cast<__m128i*>(out);
    _mm_storeu_si128(target, _mm_unpacklo_epi8(block, _mm_setzero_si128()));
    _mm_storeu_si128(target + 1, _mm_unpackhi_epi8(block, _mm_setzero_si128()));
}

FILEIO_FOR_SSSE3 unsigned highestBits(__m128i block) {
    return static_cast<unsigned>(_mm_movemask_epi8(block));
}

// The bytes that end a line, as masks.
FILEIO_FOR_SSSE3 __m128i lineEnds(__m128i block) {
    const __m128i feeds = _mm_cmpeq_epi8(block, _mm_set1_epi8('\n'));
    const __m128i carriages = _mm_cmpeq_epi8(block, _mm_set1_epi8('\r'));
    return _mm_or_si128(feeds, carriages);
}

// Goes to the end of a line only, if asked to.
template <bool isLine>
FILEIO_FOR_SSSE3 Progress decodeWindows(const char* bytes, std::size_t count, char16_t* out,
                                        std::size_t room) {
    std::size_t taken = 0;
    std::size_t made = 0;
    while (count - taken >= loadedBytes && room - made >= loadedBytes) {
        const __m128i block = load(bytes + taken);
        const __m128i endMasks = isLine ? lineEnds(block) : _mm_setzero_si128();
        const bool isPlain = highestBits(_mm_or_si128(block, endMasks)) == 0;
        const bool isAscii = isPlain || highestBits(block) == 0;
        if (isAscii) widen(block, out + made);
        if (isPlain) {
            taken += loadedBytes;
            made += loadedBytes;
            continue;
        }
        const unsigned ends = highestBits(endMasks);
        const auto endsAt = static_cast<unsigned>(std::countr_zero(ends));
        if (isAscii) return {taken + endsAt, made + endsAt};
        const __m128i trails = _mm_cmplt_epi8(block, _mm_set1_epi8(static_cast<char>(0xC0)));
        const unsigned begins = ~highestBits(trails);
        const Window window = tables.windows[begins >> 1 & ((1U << windowBytes) - 1)];
        if (window.shuffle == noShuffle) break;
        const __m128i lanes = _mm_shuffle_epi8(block, load(&tables.shuffles[window.shuffle]));
        const bool isShort = window.shuffle < shortShuffles;
        if (!(isShort ? storeShort(lanes, out + made) : storeLong(lanes, out + made))) break;
        if (endsAt < window.bytes) {
            const int units = std::popcount(begins & ~ends & (ends - 1));
            return {taken + endsAt, made + static_cast<std::size_t>(units)};
        }
        taken += window.bytes;
        made += static_cast<std::size_t>(isShort ? shortCharacters : longCharacters);
    }
    return {taken, made};
}

}  // namespace

Progress decodeMixedUtf8(const char* bytes, std::size_t count, char16_t* out, std::size_t room) {
    if (!hasSsse3) return {0, 0};
    return decodeWindows<false>(bytes, count, out, room);
}

Progress decodeMixedUtf8Line(const char* bytes, std::size_t count, char16_t* out,
                             std::size_t room) {
    if (!hasSsse3) return {0, 0};
    return decodeWindows<true>(bytes, count, out, room);
}

}  // namespace Orvandeil::FileIO::detail

#else

namespace Orvandeil::FileIO::detail {

Progress decodeMixedUtf8(const char*, std::size_t, char16_t*, std::size_t) {
    return {0, 0};
}
Progress decodeMixedUtf8Line(const char*, std::size_t, char16_t*, std::size_t) {
    return {0, 0};
}

}  // namespace Orvandeil::FileIO::detail

#endif
