#pragma once

#include <bit>
#include <charconv>
#include <cmath>
#include <cstdint>

// The fast way to the shortest text of a double that has few digits, as most measured and typed
// numbers have: the general one works out all that a double holds.
namespace cli {

inline constexpr double powersOfTen[] = {1e-4, 1e-3, 1e-2, 1e-1, 1e0,  1e1, 1e2,  1e3,
                                         1e4,  1e5,  1e6,  1e7,  1e8,  1e9, 1e10, 1e11,
                                         1e12, 1e13, 1e14, 1e15, 1e16, 1e17};

// 10 to the power `exponent`, from -4 to 17; exact from 0 on.
inline double powerOfTen(int exponent) {
    return powersOfTen[exponent + 4];
}

// The digits before the point, for numbers from 0.001 below 10^15; less than 1 for zeros behind it.
inline int wholeDigits(double magnitude) {
    const int exponent = static_cast<int>(std::bit_cast<std::uint64_t>(magnitude) >> 52) - 1023;
    // Of the logarithms of 2 to the exponent and of what is less than twice that, to base 10.
    const int atLeast = (exponent * 1233) >> 12;
    return atLeast + (magnitude >= powerOfTen(atLeast)) + (magnitude >= powerOfTen(atLeast + 1));
}

// Writes `count` digits, zeros in front, and returns their end.
inline char* writeDigits(std::uint64_t value, int count, char* to) {
    for (int i = count; i-- > 0; value /= 10)
        to[i] = static_cast<char>('0' + value % 10);
    return to + count;
}

// Takes zeros off the end of the decimals.
inline void dropZeros(std::uint64_t& digits, int& decimals) {
    for (; digits % 10000 == 0; digits /= 10000)
        decimals -= 4;
    for (; digits % 10 == 0; digits /= 10)
        --decimals;
}

// The shortest text of a finite number that is not whole and below 10^15; null, and it is for the
// general way, when it begins behind the third decimal or takes more than 15 digits. Two decimals
// of up to 15 digits are never the same double, so that the one found is the shortest.
inline char* writeFewDigits(double value, char* to) {
    constexpr int mostDigits = 15;
    const double magnitude = std::fabs(value);
    if (magnitude < powerOfTen(-3)) return nullptr;
    int decimals = mostDigits - wholeDigits(magnitude);
    const double scale = powerOfTen(decimals);
    // Off by less than a half, from the number's own rounding and the product's.
    auto digits = static_cast<std::uint64_t>(magnitude * scale + 0.5);
    if (static_cast<double>(digits) / scale != magnitude) return nullptr;
    dropZeros(digits, decimals);
    const auto unit = static_cast<std::uint64_t>(powerOfTen(decimals));
    if (value < 0) *to++ = '-';
    to = std::to_chars(to, to + mostDigits, digits / unit).ptr;
    *to++ = '.';
    return writeDigits(digits % unit, decimals, to);
}

}  // namespace cli
