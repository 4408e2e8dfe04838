#pragma once

#include <array>
#include <bit>
#include <charconv>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <iterator>
#include <system_error>

// Decimal numbers read in place, as C's strtoll and strtod read them: for the fast paths of the
// scans. Numbers out of the ordinary are declined, for the plain code to read.
namespace Orvandeil::FileIO::detail {

// 10^0 to 10^19, all that 64 bits hold.
inline constexpr auto integerPowersOfTen = [] {
    std::array<std::uint64_t, 20> powers = {1};
    for (std::size_t i = 1; i < powers.size(); ++i) {
        powers[i] = powers[i - 1] * 10;
    }
    return powers;
}();

// The blanks of the C locale, whatever the locale in use.
constexpr bool isCBlank(char byte) {
    return byte == ' ' || (byte >= '\t' && byte <= '\r');
}

// Bytes in memory. `isAll` tells that the data end with them; else the byte behind a number must be
// among them, as it may belong to it.
struct FieldBytes {
    const char* next;
    const char* end;
    bool isAll;

    // Nothing behind a width belongs to a number; a negative one is none.
    void cutTo(long width) {
        if (width < 0 || end - next < width) return;
        end = next + width;
        isAll = true;
    }
    bool mayEnd() const { return next != end || isAll; }
    bool startsWith(char byte) const { return next != end && *next == byte; }
    template <class Test>
    void skip(Test test) {
        while (next != end && test(*next))
            ++next;
    }
    // Without branches, as signs may come in any order.
    bool takeMinus() {
        if (next == end) return false;
        const bool negative = *next == '-';
        next += static_cast<int>(negative) | static_cast<int>(*next == '+');
        return negative;
    }
};

// The value of eight digits, given as their values, the first one lowest.
inline std::uint64_t valueOfEight(std::uint64_t digits) {
    constexpr std::uint64_t everyFourth = 0x000000FF000000FF;
    digits = digits * 10 + (digits >> 8);
    return ((digits & everyFourth) * 0x000F424000000064 +
            ((digits >> 16) & everyFourth) * 0x0000271000000001) >>
           32;
}

// Takes the digits that come next and appends them to `value`, modulo 2^64. Returns their number.
inline std::size_t takeDigits(FieldBytes& bytes, std::uint64_t& value) {
    const char* const start = bytes.next;
    while (std::endian::native == std::endian::little && bytes.end - bytes.next >= 8) {
        std::uint64_t block;
        std::memcpy(&block, bytes.next, sizeof block);
        block ^= 0x3030303030303030;
        // The lowest bit set is in the first byte above 9; those behind it may be wrong.
        const std::uint64_t others = ((block + 0x7676767676767676) | block) & 0x8080808080808080;
        const auto count = static_cast<unsigned>(std::countr_zero(others)) / 8;
        if (count == 0) return static_cast<std::size_t>(bytes.next - start);
        value = value * integerPowersOfTen[count] + valueOfEight(block << (64 - 8 * count));
        bytes.next += count;
        if (count < 8) return static_cast<std::size_t>(bytes.next - start);
    }
    for (; bytes.next != bytes.end && *bytes.next >= '0' && *bytes.next <= '9'; ++bytes.next) {
        value = value * 10 + static_cast<std::uint64_t>(*bytes.next - '0');
    }
    return static_cast<std::size_t>(bytes.next - start);
}

struct DecimalInteger {
    std::uint64_t magnitude = 0;
    bool negative = false;

    long asSigned() const {
        const auto value = static_cast<long>(magnitude);
        return negative ? -value : value;
    }
};

// Takes a sign and 1 to 18 digits; false, with `bytes` used up somehow, when there is anything
// else.
inline bool takeInteger(FieldBytes& bytes, DecimalInteger& number) {
    number.negative = bytes.takeMinus();
    number.magnitude = 0;
    const std::size_t digits = takeDigits(bytes, number.magnitude);
    return digits - 1 < 18 && bytes.mayEnd();
}

// mantissa * 10^exponent in one correct rounding; false where that takes more than 64 bits and the
// arithmetic of doubles.
inline bool scaleByTen(std::uint64_t mantissa, long exponent, double& value) {
    static constexpr double exactPowers[] = {1e0,  1e1,  1e2,  1e3,  1e4,  1e5,  1e6,  1e7,
                                             1e8,  1e9,  1e10, 1e11, 1e12, 1e13, 1e14, 1e15,
                                             1e16, 1e17, 1e18, 1e19, 1e20, 1e21, 1e22};
    constexpr std::uint64_t exactMantissas = std::uint64_t{1} << 53;
    if (mantissa <= exactMantissas && exponent >= -22 && exponent <= 22) {
        value = static_cast<double>(mantissa);
        value = exponent < 0 ? value / exactPowers[-exponent] : value * exactPowers[exponent];
        return true;
    }
    if (exponent > 0 || -exponent >= std::ssize(integerPowersOfTen)) return false;
    // A quotient of 62 or 63 bits, the lowest one standing for all that is behind it too, so that
    // its conversion rounds once.
    const std::uint64_t power = integerPowersOfTen[static_cast<std::size_t>(-exponent)];
    const int shift = std::countl_zero(mantissa), powerShift = std::countl_zero(power);
    const std::uint64_t divisor = power << powerShift;
    const unsigned __int128 dividend = static_cast<unsigned __int128>(mantissa << shift) << 62;
    const auto quotient = static_cast<std::uint64_t>(dividend / divisor);
    const bool isInexact = quotient * divisor != static_cast<std::uint64_t>(dividend);
    const auto scale = static_cast<std::uint64_t>(1023 - 62 + powerShift - shift);
    value = static_cast<double>(static_cast<std::int64_t>(quotient | isInexact)) *
            std::bit_cast<double>(scale << 52);
    return true;
}

// Takes a complete exponent, if there is one, and adds it to `exponent`. False for what only begins
// like one, for the "x" of a hexadecimal number, and for an exponent far out of range.
inline bool takeExponent(FieldBytes& bytes, long& exponent) {
    if (bytes.next == bytes.end) return true;
    const int letter = *bytes.next | 0x20;
    if (letter != 'e') return letter != 'x';
    ++bytes.next;
    const bool negative = bytes.takeMinus();
    std::uint64_t power = 0;
    if (takeDigits(bytes, power) - 1 >= 6) return false;
    exponent += negative ? -static_cast<long>(power) : static_cast<long>(power);
    return true;
}

// Takes a sign, digits with a point, and an exponent; false, with `bytes` used up somehow, when
// there is anything else or the number has no double of the full precision.
inline bool takeReal(FieldBytes& bytes, double& value) {
    const bool negative = bytes.takeMinus();
    const char* const start = bytes.next;
    std::uint64_t mantissa = 0;
    std::size_t digits = takeDigits(bytes, mantissa);
    long exponent = 0;
    if (bytes.startsWith('.')) {
        ++bytes.next;
        const std::size_t decimals = takeDigits(bytes, mantissa);
        digits += decimals;
        exponent = -static_cast<long>(decimals);
    }
    if (digits == 0 || !takeExponent(bytes, exponent) || !bytes.mayEnd()) return false;
    constexpr std::size_t digitsOf64Bits = 19;
    if (digits > digitsOf64Bits || !scaleByTen(mantissa, exponent, value)) {
        const auto read = std::from_chars(start, bytes.next, value);
        if (read.ec != std::errc() || read.ptr != bytes.next) return false;
    }
    if (negative) value = -value;
    return true;
}

}  // namespace Orvandeil::FileIO::detail
