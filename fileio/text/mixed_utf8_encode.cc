#include "fileio/buffers/vector_unit.h"
#include "fileio/text/mixed_utf8.h"

#ifdef FILEIO_VECTOR_UNITS

#include <array>
#include <cstdint>
#include <tmmintrin.h>

namespace Orvandeil::FileIO::detail {
namespace {

constexpr std::size_t blockUnits = 8;
constexpr std::size_t blockBytes = 16;

// What to keep of lanes whose characters are shorter than they.
struct Packing {
    std::array<std::uint8_t, blockBytes> shuffle{};
    std::uint8_t bytes = 0;
};
using Packings = std::array<Packing, 256>;

consteval Packing packLanes(unsigned lanes, unsigned laneBytes, unsigned twoOrMore,
                            unsigned three) {
    Packing packing;
    packing.shuffle.fill(0x80);
    for (unsigned lane = 0; lane < lanes; ++lane) {
        const unsigned length = 1 + (twoOrMore >> lane & 1) + (three >> lane & 1);
        for (unsigned i = 0; i < length; ++i)
            packing.shuffle[packing.bytes++] = static_cast<std::uint8_t>(lane * laneBytes + i);
    }
    return packing;
}

// By a bit for each of eight lanes of one or two bytes.
consteval Packings makeShortPackings() {
    Packings packings;
    for (unsigned mask = 0; mask < packings.size(); ++mask)
        packings[mask] = packLanes(8, 2, mask, 0);
    return packings;
}

// By two bits for each of four lanes of one to three bytes.
consteval Packings makeLongPackings() {
    Packings packings;
    for (unsigned mask = 0; mask < packings.size(); ++mask)
        packings[mask] = packLanes(4, 4, mask & 0xF, mask >> 4);
    return packings;
}

constexpr Packings shortPackings = makeShortPackings();
constexpr Packings longPackings = makeLongPackings();

FILEIO_FOR_SSSE3 __m128i load(const void* place) {
    return _mm_loadu_si128(static_cast<const __m128i*>(place));
}

FILEIO_FOR_SSSE3 char* store(__m128i lanes, const Packing& packing, char* out) {
    const __m128i packed = _mm_shuffle_epi8(lanes, load(&packing.shuffle));
    _mm_storeu_si128(reinterpret_cast<__m128i*>(out), packed);
    return out + packing.bytes;
}

FILEIO_FOR_SSSE3 __m128i choose(__m128i mask, __m128i set, __m128i clear) {
    return _mm_or_si128(_mm_and_si128(mask, set), _mm_andnot_si128(mask, clear));
}

// Units below 0x800.
FILEIO_FOR_SSSE3 char* encodeShort(__m128i units, char* out) {
    const __m128i isLong = _mm_cmpgt_epi16(units, _mm_set1_epi16(0x7F));
    const __m128i lead = _mm_srli_epi16(units, 6);
    const __m128i trail = _mm_slli_epi16(_mm_and_si128(units, _mm_set1_epi16(0x3F)), 8);
    const __m128i pairs =
        _mm_or_si128(_mm_or_si128(lead, trail), _mm_set1_epi16(static_cast<short>(0x80C0)));
    const int mask = _mm_movemask_epi8(_mm_packs_epi16(isLong, isLong)) & 0xFF;
    return store(choose(isLong, pairs, units), shortPackings[static_cast<unsigned>(mask)], out);
}

// Four units in lanes of 32 bits.
FILEIO_FOR_SSSE3 char* encodeLong(__m128i units, char* out) {
    const __m128i isLong = _mm_cmpgt_epi32(units, _mm_set1_epi32(0x7F));
    const __m128i isLongest = _mm_cmpgt_epi32(units, _mm_set1_epi32(0x7FF));
    const __m128i sixBits = _mm_set1_epi32(0x3F);
    const __m128i top = _mm_srli_epi32(units, 12);
    const __m128i upper = _mm_srli_epi32(units, 6);
    const __m128i middle = _mm_slli_epi32(_mm_and_si128(upper, sixBits), 8);
    const __m128i low = _mm_and_si128(units, sixBits);
    const __m128i two =
        _mm_or_si128(_mm_or_si128(upper, _mm_slli_epi32(low, 8)), _mm_set1_epi32(0x80C0));
    const __m128i three = _mm_or_si128(
        _mm_or_si128(_mm_or_si128(top, middle), _mm_slli_epi32(low, 16)), _mm_set1_epi32(0x8080E0));
    const __m128i lanes = choose(isLongest, three, choose(isLong, two, units));
    const int mask = _mm_movemask_ps(_mm_castsi128_ps(isLong)) |
                     _mm_movemask_ps(_mm_castsi128_ps(isLongest)) << 4;
    return store(lanes, longPackings[static_cast<unsigned>(mask)], out);
}

FILEIO_FOR_SSSE3 bool isAllZero(__m128i block) {
    return _mm_movemask_epi8(_mm_cmpeq_epi16(block, _mm_setzero_si128())) == 0xFFFF;
}

FILEIO_FOR_SSSE3 Progress encodeBlocks(const char16_t* text, std::size_t units, char* out) {
    const __m128i zero = _mm_setzero_si128();
    char* target = out;
    std::size_t i = 0;
    // What is stored is twice sixteen bytes at most, and three are there for each unit.
    for (; units - i >= 2 * blockUnits; i += blockUnits) {
        const __m128i block = load(text + i);
        const __m128i topBits = _mm_and_si128(block, _mm_set1_epi16(static_cast<short>(0xF800)));
        const __m128i beyondAscii = _mm_and_si128(block, _mm_set1_epi16(-0x80));
        if (isAllZero(beyondAscii)) {
            _mm_storel_epi64(reinterpret_cast<__m128i*>(target), _mm_packus_epi16(block, zero));
            target += blockUnits;
        } else if (isAllZero(topBits)) {
            target = encodeShort(block, target);
        } else {
            const __m128i surrogate = _mm_set1_epi16(static_cast<short>(0xD800));
            if (!isAllZero(_mm_cmpeq_epi16(topBits, surrogate))) break;
            target = encodeLong(_mm_unpacklo_epi16(block, zero), target);
            target = encodeLong(_mm_unpackhi_epi16(block, zero), target);
        }
    }
    return {i, static_cast<std::size_t>(target - out)};
}

}  // namespace

Progress encodeMixedUtf8(const char16_t* text, std::size_t units, char* out) {
    if (!hasSsse3) return {0, 0};
    return encodeBlocks(text, units, out);
}

}  // namespace Orvandeil::FileIO::detail

#else

namespace Orvandeil::FileIO::detail {

Progress encodeMixedUtf8(const char16_t*, std::size_t, char*) {
    return {0, 0};
}

}  // namespace Orvandeil::FileIO::detail

#endif
