#include "fileio/printf/whole_run.h"

#include "fileio/printf/number_field.h"

#include <bit>
#include <cstring>
#include <string_view>
#include <type_traits>
#include <utility>

#ifdef __SSE2__
#include <emmintrin.h>
#endif

namespace Orvandeil::FileIO::detail {
namespace {

constexpr long mostDecimal = tenTo8 - 1;
constexpr long mostHex = 0xFFFFFFFF;

// A run taken apart, so that the steps that are the same for all go over several at once.
struct Run {
    alignas(16) std::uint32_t values[wholeRun];
    alignas(16) std::uint64_t digits[wholeRun];
};
static_assert(wholeRun % 4 == 0);

// Stores the lower 32 bits of the elements, if all of them are whole numbers between the limits.
template <class Element>
bool takeWholes(const Element* from, long lowest, long highest, std::uint32_t* to) {
    bool good = true;
    for (std::size_t i = 0; i < wholeRun; ++i) {
        const Element value = from[i];
        if constexpr (std::is_floating_point_v<Element>) {
            const bool isInside =
                value >= static_cast<double>(lowest) && value <= static_cast<double>(highest);
            const long whole = isInside ? static_cast<long>(value) : 0;
            to[i] = static_cast<std::uint32_t>(whole);
            good = good && static_cast<double>(whole) == value;
        } else {
            to[i] = static_cast<std::uint32_t>(value);
            good = good && std::cmp_greater_equal(value, lowest) &&
                   std::cmp_less_equal(value, highest);
        }
    }
    return good;
}
#ifdef __SSE2__
// A whole number added to this one is in its lower bits, and anything else is not what is left when
// it is subtracted again.
bool takeWholes(const double* from, long lowest, long highest, std::uint32_t* to) {
    const __m128d aligned = _mm_set1_pd(0x1.8p52);
    const __m128d low = _mm_set1_pd(static_cast<double>(lowest));
    const __m128d high = _mm_set1_pd(static_cast<double>(highest));
    __m128d good = _mm_cmpeq_pd(low, low);
    for (std::size_t i = 0; i < wholeRun; i += 2) {
        const __m128d value = _mm_loadu_pd(from + i);
        const __m128d moved = _mm_add_pd(value, aligned);
        const __m128d whole = _mm_cmpeq_pd(_mm_sub_pd(moved, aligned), value);
        const __m128d inside = _mm_and_pd(_mm_cmpge_pd(value, low), _mm_cmple_pd(value, high));
        good = _mm_and_pd(good, _mm_and_pd(whole, inside));
        const __m128i lower = _mm_shuffle_epi32(_mm_castpd_si128(moved), 0x08);
        _mm_storel_epi64(reinterpret_cast<__m128i*>(to + i), lower);
    }
    return _mm_movemask_pd(good) == 3;
}

__m128i divided(__m128i lanes, short factor, int shift) {
    return _mm_srli_epi16(_mm_mulhi_epu16(lanes, _mm_set1_epi16(factor)), shift);
}

// As eightDigits(), two numbers below 10^8, one in each half. Again the factors are exact for the
// range of a lane.
__m128i twiceEightDigits(__m128i numbers) {
    const __m128i byTenTo4 = _mm_set1_epi64x(0xD1B71759);
    const __m128i front = _mm_srli_epi64(_mm_mul_epu32(numbers, byTenTo4), 45);
    const __m128i back = _mm_sub_epi64(numbers, _mm_mul_epu32(front, _mm_set1_epi64x(10000)));
    const __m128i fours = _mm_or_si128(front, _mm_slli_epi64(back, 32));
    const __m128i hundreds = divided(fours, 5243, 3);
    const __m128i rest = _mm_sub_epi16(fours, _mm_mullo_epi16(hundreds, _mm_set1_epi16(100)));
    const __m128i pairs = _mm_or_si128(hundreds, _mm_slli_epi32(rest, 16));
    const __m128i tens = divided(pairs, 6554, 0);
    const __m128i last = _mm_sub_epi16(pairs, _mm_mullo_epi16(tens, _mm_set1_epi16(10)));
    return _mm_or_si128(tens, _mm_slli_epi16(last, 8));
}

// The sign of each element stays in its value.
void splitDecimals(Run& run) {
    for (std::size_t i = 0; i < wholeRun; i += 4) {
        const __m128i values = _mm_load_si128(reinterpret_cast<const __m128i*>(run.values + i));
        const __m128i signs = _mm_srai_epi32(values, 31);
        const __m128i numbers = _mm_sub_epi32(_mm_xor_si128(values, signs), signs);
        const __m128i zero = _mm_setzero_si128();
        auto* const digits = reinterpret_cast<__m128i*>(run.digits + i);
        _mm_store_si128(digits, twiceEightDigits(_mm_unpacklo_epi32(numbers, zero)));
        _mm_store_si128(digits + 1, twiceEightDigits(_mm_unpackhi_epi32(numbers, zero)));
    }
}

void splitHexes(Run& run, bool upper) {
    const __m128i low = _mm_set1_epi8(0x0F);
    const __m128i toLetter = _mm_set1_epi8(upper ? 'A' - '9' - 1 : 'a' - '9' - 1);
    const auto letters = [&](__m128i nibbles) {
        const __m128i above = _mm_cmpgt_epi8(nibbles, _mm_set1_epi8(9));
        return _mm_add_epi8(_mm_add_epi8(nibbles, _mm_set1_epi8('0')),
                            _mm_and_si128(above, toLetter));
    };
    for (std::size_t i = 0; i < wholeRun; i += 4) {
        __m128i values = _mm_load_si128(reinterpret_cast<const __m128i*>(run.values + i));
        values = _mm_or_si128(_mm_slli_epi16(values, 8), _mm_srli_epi16(values, 8));
        values = _mm_shufflehi_epi16(_mm_shufflelo_epi16(values, 0xB1), 0xB1);
        const __m128i upperHalf = _mm_and_si128(_mm_srli_epi16(values, 4), low);
        const __m128i lowerHalf = _mm_and_si128(values, low);
        auto* const digits = reinterpret_cast<__m128i*>(run.digits + i);
        _mm_store_si128(digits, letters(_mm_unpacklo_epi8(upperHalf, lowerHalf)));
        _mm_store_si128(digits + 1, letters(_mm_unpackhi_epi8(upperHalf, lowerHalf)));
    }
}
#else
void splitDecimals(Run& run) {
    for (std::size_t i = 0; i < wholeRun; ++i) {
        const auto value = static_cast<std::int32_t>(run.values[i]);
        run.digits[i] = eightDigits(value < 0 ? 0 - run.values[i] : run.values[i]);
    }
}
void splitHexes(Run& run, bool upper) {
    for (std::size_t i = 0; i < wholeRun; ++i)
        run.digits[i] = eightHexDigits(run.values[i], upper);
}
#endif

// The text behind each number is copied by a fixed number of bytes, which a string of up to 15 has
// in the object itself; those beyond its end are overwritten by what comes next.
template <std::size_t textBytes>
char* writeDecimals(char* out, const Run& run, const std::string& behind) {
    char text[textBytes];
    std::memcpy(text, behind.data(), textBytes);
    const std::size_t length = behind.size();
    for (std::size_t i = 0; i < wholeRun; ++i) {
        *out = '-';
        out += run.values[i] >> 31;
        // The highest bit stands for the last digit, which is written also when it is 0.
        const int leading = std::countr_zero(run.digits[i] | 1UL << 63) & ~7;
        storeBytes(out, (run.digits[i] | eightZeros) >> leading);
        out += 8 - leading / 8;
        std::memcpy(out, text, textBytes);
        out += length;
    }
    return out;
}

template <std::size_t textBytes>
char* writeHexes(char* out, const Run& run, const std::string& behind) {
    char text[textBytes];
    std::memcpy(text, behind.data(), textBytes);
    const std::size_t length = behind.size();
    for (std::size_t i = 0; i < wholeRun; ++i) {
        const int leading = std::countl_zero(run.values[i] | 1) / 4;
        storeBytes(out, run.digits[i] >> 8 * leading);
        out += 8 - leading;
        std::memcpy(out, text, textBytes);
        out += length;
    }
    return out;
}

}  // namespace

bool isRunForm(const NumberForm& form, const std::string& behind) {
    const bool isKnown = std::string_view("duxX").find(form.conversion) != std::string_view::npos;
    return form.bare && isKnown && behind.size() < 16;
}

template <class Element>
char* writeRun(char* out, const NumberForm& form, const std::string& behind,
               const Element* values) {
    Run run;
    const bool isHex = (form.conversion | 0x20) == 'x';
    const long lowest = form.conversion == 'd' ? -mostDecimal : 0;
    if (!takeWholes(values, lowest, isHex ? mostHex : mostDecimal, run.values)) {
        return nullptr;
    }
    const bool isShort = behind.size() <= 8;
    if (isHex) {
        splitHexes(run, form.conversion == 'X');
        return isShort ? writeHexes<8>(out, run, behind) : writeHexes<16>(out, run, behind);
    }
    splitDecimals(run);
    return isShort ? writeDecimals<8>(out, run, behind) : writeDecimals<16>(out, run, behind);
}

template char* writeRun(char* out, const NumberForm& form, const std::string& behind,
                        const double* values);
template char* writeRun(char* out, const NumberForm& form, const std::string& behind,
                        const long* values);
template char* writeRun(char* out, const NumberForm& form, const std::string& behind,
                        const unsigned long* values);

}  // namespace Orvandeil::FileIO::detail
