#include "fileio/text/ascii_set.h"

#include <algorithm>
#include <bit>

#ifdef __SSE2__
#include <emmintrin.h>
#endif

namespace Orvandeil::FileIO::detail {

#ifdef __SSE2__
static __m128i load(const void* place) {
    return _mm_loadu_si128(static_cast<const __m128i*>(place));
}
#endif

// A block is compared with every gap: with more of them the table is as fast.
void AsciiSet::findGaps() {
    constexpr std::size_t mostGaps = 6;
    for (unsigned char low = 0, behind; low < 0x80; low = behind) {
        behind = static_cast<unsigned char>(low + 1);
        if (answers[low]) continue;
        while (behind < 0x80 && !answers[behind])
            ++behind;
        gaps.emplace_back();
        gaps.back().lowest.fill(low);
        gaps.back().spread.fill(static_cast<unsigned char>(behind - 1 - low));
    }
    if (gaps.size() > mostGaps) gaps.clear();
}

std::size_t AsciiSet::lengthOf(const char* bytes, std::size_t count) const {
    std::size_t i = 0;
#ifdef __SSE2__
    for (; count - i >= blockBytes && !gaps.empty(); i += blockBytes) {
        const __m128i block = load(bytes + i);
        __m128i others = block;  // of which the highest bit counts
        for (const Gap& gap : gaps) {
            const __m128i distance = _mm_sub_epi8(block, load(gap.lowest.data()));
            const __m128i near = _mm_min_epu8(distance, load(gap.spread.data()));
            others = _mm_or_si128(others, _mm_cmpeq_epi8(near, distance));
        }
        const auto mask = static_cast<unsigned>(_mm_movemask_epi8(others));
        if (mask != 0) return i + static_cast<std::size_t>(std::countr_zero(mask));
    }
#endif
    while (i < count && has(bytes[i]))
        ++i;
    return i;
}

void widenAscii(const char* bytes, std::size_t count, std::size_t room, char16_t* out) {
    std::size_t i = 0;
#ifdef __SSE2__
    constexpr std::size_t block = sizeof(__m128i);
    for (; i < count && room - i >= block; i += block) {
        const __m128i ascii = load(bytes + i);
        auto* const units = reinterpret_cast<__m128i*>(out + i);
        _mm_storeu_si128(units, _mm_unpacklo_epi8(ascii, _mm_setzero_si128()));
        _mm_storeu_si128(units + 1, _mm_unpackhi_epi8(ascii, _mm_setzero_si128()));
    }
#endif
    for (; i < count; ++i)
        out[i] = static_cast<unsigned char>(bytes[i]);
}

}  // namespace Orvandeil::FileIO::detail
