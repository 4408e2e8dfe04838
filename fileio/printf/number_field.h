#pragma once

#include "fileio/printf/decimal_digits.h"
#include "fileio/printf/number_text.h"

#include <cstring>

namespace Orvandeil::FileIO::detail {

inline constexpr Word128 sixteenBlanks = sixteenZeros / 3 * 2;

// Fills without a loop where it can, and then up to sixteen bytes too far.
inline char* fillAhead(char* out, char filling, std::size_t count) {
    if (count > 16) {
        std::memset(out, filling, count);
    } else {
        storeBytes(out, filling == '0' ? sixteenZeros : sixteenBlanks);
    }
    return out + count;
}

// What stands in front of a number's `length` digits: padding and sign, a 0 for none. Knowing the
// length beforehand saves moving what was just written, which the processor would wait for.
inline char* openField(char* out, const NumberForm& form, char sign, std::size_t length) {
    const std::size_t total = length + (sign != 0 ? 1 : 0);
    const auto width = static_cast<std::size_t>(form.width);
    const std::size_t padding = total < width && !form.leftJustify ? width - total : 0;
    if (padding != 0 && !form.zeroFill) out = fillAhead(out, ' ', padding);
    *out = sign;
    out += sign != 0 ? 1 : 0;
    if (padding != 0 && form.zeroFill) out = fillAhead(out, '0', padding);
    return out;
}

// A whole number below 10^8 without a field around it.
inline char* writeBare(char* out, bool negative, std::uint64_t magnitude) {
    const std::uint64_t digits = eightDigits(magnitude);
    // The highest bit stands for the last digit, which is written also when it is 0.
    const int leading = leadingZeroBytes(digits | 1UL << 63);
    *out = '-';
    out += negative ? 1 : 0;
    storeBytes(out, (digits | eightZeros) >> 8 * leading);
    return out + 8 - leading;
}

inline int hexLength(unsigned long value) {
    return (static_cast<int>(std::bit_width(value | 1)) + 3) / 4;
}

// The eight digits of 32 bits, in either case.
inline std::uint64_t eightHexDigits(std::uint64_t value, bool upper) {
    value = (value & 0xFFFF) | (value & 0xFFFF0000) << 16;
    value = (value | value << 8) & 0x00FF00FF00FF00FF;
    value = (value | value << 4) & 0x0F0F0F0F0F0F0F0F;
    const std::uint64_t letters = (value + 0x0606060606060606) >> 4 & 0x0101010101010101;
    return __builtin_bswap64(value + eightZeros + letters * (upper ? 7 : 39));
}

// The digits of 32 bits without a field around them.
inline char* writeBareHex(char* out, std::uint64_t value, bool upper) {
    const int count = hexLength(value);
    storeBytes(out, eightHexDigits(value, upper) >> 8 * (8 - count));
    return out + count;
}

// What stands behind it.
inline char* closeField(char* begin, char* end, const NumberForm& form) {
    const auto length = static_cast<std::size_t>(end - begin);
    const auto width = static_cast<std::size_t>(form.width);
    return form.leftJustify && length < width ? fillAhead(end, ' ', width - length) : end;
}

}  // namespace Orvandeil::FileIO::detail
