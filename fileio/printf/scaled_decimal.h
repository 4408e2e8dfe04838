#pragma once

#include <cstdint>

namespace Orvandeil::FileIO::detail {

// The value `significand` * 2^`exponent`; the highest bit of the significand is set.
struct Binary {
    std::uint64_t significand;
    int exponent;
};

// A finite value above 0.
Binary decompose(double value);

// floor(log10(value)).
int decimalExponent(const Binary& value);

struct Scaled {
    std::uint64_t number;
    bool certain;  // else the number may be one too small
};

// The whole number nearest to value * 10^power, halves to even. The result must be below 2^63, and
// the power within smallestPower to largestPower.
Scaled scaleAndRound(const Binary& value, int power);

inline constexpr int smallestPower = -330;
inline constexpr int largestPower = 345;

}  // namespace Orvandeil::FileIO::detail
