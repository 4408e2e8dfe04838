#pragma once

#include <climits>
#include <cstddef>
#include <string_view>

namespace Orvandeil::FileIO::detail {

// What sets the integer scan operations apart, for every stream that has them.
struct IntegerScan {
    int base;  // 0: the field's prefix tells, "0x" for hexadecimal and "0" for octal
    bool isSigned;
};

namespace scan {
inline constexpr IntegerScan octal = {8, false};
inline constexpr IntegerScan hex = {16, false};
inline constexpr IntegerScan unsignedInteger = {10, false};
inline constexpr IntegerScan integer = {10, true};
inline constexpr IntegerScan integerCouldBeHex = {0, true};
}  // namespace scan

// An integer as C's strtoll and strtoull read one, less the blanks before it.
struct IntegerField {
    std::size_t consumed = 0;  // characters; 0: the text does not begin with a number
    unsigned long magnitude = 0;
    bool negative = false;  // a minus sign was written
    bool overflow = false;  // the magnitude exceeds 64 bits

    // strtoll's result, clamped to the range of long.
    long asSigned() const {
        constexpr unsigned long largest = LONG_MAX;
        if (overflow || magnitude > largest) return negative ? LONG_MIN : LONG_MAX;
        return negative ? -static_cast<long>(magnitude) : static_cast<long>(magnitude);
    }

    // strtoull's result: a minus sign negates modulo 2^64, an overflow gives the largest value.
    unsigned long asUnsigned() const {
        if (overflow) return ULONG_MAX;
        return negative ? 0 - magnitude : magnitude;
    }

    // The same for the scans that tell a negative number other than zero by a flag. Such a number
    // out of range is 0.
    unsigned long asFlagged(bool& flag) const {
        flag = negative && asUnsigned() != 0;
        return flag && overflow ? 0 : asUnsigned();
    }
};

// Reads an optional sign, the base's prefix and digits from the start of `text`. It depends on no
// locale and needs no terminator.
IntegerField parseInteger(std::string_view text, const IntegerScan& operation);

}  // namespace Orvandeil::FileIO::detail
