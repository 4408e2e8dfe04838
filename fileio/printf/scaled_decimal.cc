#include "fileio/printf/scaled_decimal.h"

#include "fileio/printf/decimal_digits.h"

#include <array>
#include <bit>

namespace Orvandeil::FileIO::detail {
namespace {

// 256 bits, the lowest word first. Powers of ten are stepped through with twice the bits that are
// kept, so that what each step cuts off never reaches those.
using Wide = std::array<std::uint64_t, 4>;

consteval Wide timesTen(const Wide& number, std::uint64_t& carry) {
    Wide product{};
    carry = 0;
    for (std::size_t i = 0; i < number.size(); ++i) {
        const Word128 part = Word128{number[i]} * 10 + carry;
        product[i] = static_cast<std::uint64_t>(part);
        carry = static_cast<std::uint64_t>(part >> 64);
    }
    return product;
}

// number * 2^64 / 10, less its lowest word: `front` receives the word above it.
consteval Wide overTen(const Wide& number, std::uint64_t& front) {
    Wide quotient{};
    front = number[3] / 10;
    std::uint64_t rest = number[3] % 10;
    for (std::size_t i = number.size(); i-- != 0;) {
        const Word128 part = Word128{rest} << 64 | (i == 0 ? 0 : number[i - 1]);
        quotient[i] = static_cast<std::uint64_t>(part / 10);
        rest = static_cast<std::uint64_t>(part % 10);
    }
    return quotient;
}

consteval Wide shiftedRight(const Wide& number, std::uint64_t front, int bits) {
    Wide shifted{};
    for (std::size_t i = 0; i < number.size(); ++i) {
        const std::uint64_t above = i + 1 < number.size() ? number[i + 1] : front;
        shifted[i] = bits == 0 ? number[i] : number[i] >> bits | above << (64 - bits);
    }
    return shifted;
}

// The upper 128 bits of 10^power, the highest of them set; exact for powers from 0 to 55, and
// else too small by less than one in the last place.
struct Power {
    std::uint64_t high;
    std::uint64_t low;
};
using Powers = std::array<Power, largestPower - smallestPower + 1>;

consteval Powers makePowers() {
    Powers powers{};
    Wide number = {0, 0, 0, 1UL << 63};
    for (int power = 0; power <= largestPower; ++power) {
        powers[static_cast<std::size_t>(power - smallestPower)] = {number[3], number[2]};
        std::uint64_t front = 0;
        number = timesTen(number, front);
        number = shiftedRight(number, front, 64 - std::countl_zero(front));
    }
    number = {0, 0, 0, 1UL << 63};
    for (int power = -1; power >= smallestPower; --power) {
        std::uint64_t front = 0;
        number = overTen(number, front);
        number = shiftedRight(number, front, 64 - std::countl_zero(front));
        powers[static_cast<std::size_t>(power - smallestPower)] = {number[3], number[2]};
    }
    return powers;
}

constexpr Powers powersOfTen = makePowers();
constexpr int largestExactPower = 55;

constexpr const Power& tenTo(int power) {
    return powersOfTen[static_cast<std::size_t>(power - smallestPower)];
}

// floor(log2(10^power)) and floor(log10(2^power)), for the powers that a double can need.
constexpr int binaryLogOfTenTo(int power) {
    return power * 217706 >> 16;
}
constexpr int decimalLogOfTwoTo(int power) {
    return power * 78913 >> 18;
}

// An exact value that the table cannot decide: whole numbers divide without it.
bool divideExactly(const Binary& value, int power, std::uint64_t& number) {
    constexpr int largestDivisor = 19;
    if (power >= 0 || power < -largestDivisor || value.exponent > 0 || value.exponent < -63) {
        return false;
    }
    const std::uint64_t whole = value.significand >> -value.exponent;
    if (whole << -value.exponent != value.significand) return false;
    std::uint64_t divisor = 1;
    for (int i = power; i != 0; ++i)
        divisor *= 10;
    number = whole / divisor;
    const std::uint64_t rest = whole % divisor;
    const std::uint64_t toNext = divisor - rest;
    number += rest > toNext || (rest == toNext && number % 2 != 0) ? 1 : 0;
    return true;
}

}  // namespace

Binary decompose(double value) {
    constexpr int fractionBits = 52;
    constexpr int bias = 1075;
    const auto bits = std::bit_cast<std::uint64_t>(value);
    const int biased = static_cast<int>(bits >> fractionBits & 0x7FF);
    const std::uint64_t fraction = bits & ((1UL << fractionBits) - 1);
    const std::uint64_t significand = biased != 0 ? fraction | 1UL << fractionBits : fraction;
    const int shift = std::countl_zero(significand);
    return {significand << shift, (biased != 0 ? biased : 1) - bias - shift};
}

int decimalExponent(const Binary& value) {
    const int binaryLog = value.exponent + 63;
    const int estimate = decimalLogOfTwoTo(binaryLog);
    // One power of ten at most lies between this power of two and the next.
    if (binaryLogOfTenTo(estimate + 1) != binaryLog) return estimate;
    const Power& next = tenTo(estimate + 1);
    const bool reached =
        value.significand > next.high || (value.significand == next.high && next.low == 0);
    return reached ? estimate + 1 : estimate;
}

// One product of 64 by 128 bits. What lies below its lowest bit matters for two cases only: an
// exact half, which the exact powers tell apart, and a value just below one.
Scaled scaleAndRound(const Binary& value, int power) {
    const Power& factor = tenTo(power);
    const Word128 lowProduct = Word128{value.significand} * factor.low;
    const Word128 product = Word128{value.significand} * factor.high + (lowProduct >> 64);
    const auto below = static_cast<std::uint64_t>(lowProduct);
    const bool exact = power >= 0 && power <= largestExactPower;

    // The bits of the product behind the point.
    const int fractionBits = 63 - value.exponent - binaryLogOfTenTo(power);
    if (fractionBits > 128) return {0, true};
    const std::uint64_t number =
        fractionBits == 128 ? 0 : static_cast<std::uint64_t>(product >> fractionBits);
    const Word128 fraction = fractionBits == 128 ? product : product << (128 - fractionBits);

    constexpr Word128 half = Word128{1} << 127;
    if (fraction == half && exact && below == 0) return {number + number % 2, true};
    if (fraction >= half) return {number + 1, true};
    if (exact || half - fraction > Word128{4} << (128 - fractionBits)) return {number, true};
    std::uint64_t divided = 0;
    const bool known = divideExactly(value, power, divided);
    return {known ? divided : number, known};
}

}  // namespace Orvandeil::FileIO::detail
