#include "cli/element_reader.h"

#include <algorithm>
#include <cstdint>
#include <cstdlib>
#include <string>
#include <type_traits>

namespace cli {
namespace {

// A decimal number without its sign, as 0.DIGITS times ten to the power `scale`; the first digit
// is not 0. No digits stand for zero.
struct Decimal {
    std::string digits;
    long scale = 0;

    unsigned digitAt(long place) const {
        const bool written = place >= 0 && place < static_cast<long>(digits.size());
        return written ? static_cast<unsigned>(digits[static_cast<std::size_t>(place)] - '0') : 0;
    }
};

// Far beyond every integer, and far from an overflow of `scale`.
constexpr long largestExponent = 1'000'000'000;

Decimal readDecimal(std::string_view number) {
    Decimal decimal;
    const std::size_t mantissaLength = std::min(number.find_first_of("eE"), number.size());
    const std::string_view mantissa = number.substr(0, mantissaLength);
    for (const char c : mantissa) {
        if (c != '.') decimal.digits += c;
    }
    decimal.scale = static_cast<long>(std::min(mantissa.find('.'), mantissa.size()));
    if (mantissaLength < number.size()) {
        const std::string exponent(number.substr(mantissaLength + 1));
        const long written = std::strtol(exponent.c_str(), nullptr, 10);
        decimal.scale += std::clamp(written, -largestExponent, largestExponent);
    }
    const std::size_t zeros =
        std::min(decimal.digits.find_first_not_of('0'), decimal.digits.size());
    decimal.digits.erase(0, zeros);
    decimal.scale -= static_cast<long>(zeros);
    return decimal;
}

// Rounded to a whole number, at most `limit`.
std::uint64_t wholePart(const Decimal& decimal, std::uint64_t limit) {
    if (decimal.digits.empty()) return 0;
    std::uint64_t value = 0;
    for (long place = 0; place < decimal.scale; ++place) {
        const unsigned digit = decimal.digitAt(place);
        if (digit > limit || value > (limit - digit) / 10) return limit;
        value = value * 10 + digit;
    }
    const bool roundsUp = decimal.digitAt(decimal.scale) >= 5;
    return roundsUp && value < limit ? value + 1 : value;
}

}  // namespace

template <std::floating_point T>
T readFloating(std::string_view element) {
    const std::string text(element);
    if constexpr (std::is_same_v<T, float>) {
        return std::strtof(text.c_str(), nullptr);
    } else {
        return std::strtod(text.c_str(), nullptr);
    }
}

template <std::integral T>
T readWhole(std::string_view element, T lowest, T highest) {
    const bool negative = element.starts_with('-');
    if (negative || element.starts_with('+')) element.remove_prefix(1);
    if (element == "NaN") return 0;
    if (element == "Inf") return negative ? lowest : highest;
    const auto magnitudeLimit =
        negative ? -static_cast<std::uint64_t>(lowest) : static_cast<std::uint64_t>(highest);
    const std::uint64_t magnitude = wholePart(readDecimal(element), magnitudeLimit);
    return static_cast<T>(negative ? -magnitude : magnitude);
}

template float readFloating(std::string_view);
template double readFloating(std::string_view);
template std::uint8_t readWhole(std::string_view, std::uint8_t, std::uint8_t);
template std::int8_t readWhole(std::string_view, std::int8_t, std::int8_t);
template std::uint16_t readWhole(std::string_view, std::uint16_t, std::uint16_t);
template std::int16_t readWhole(std::string_view, std::int16_t, std::int16_t);
template std::uint32_t readWhole(std::string_view, std::uint32_t, std::uint32_t);
template std::int32_t readWhole(std::string_view, std::int32_t, std::int32_t);
template std::uint64_t readWhole(std::string_view, std::uint64_t, std::uint64_t);
template std::int64_t readWhole(std::string_view, std::int64_t, std::int64_t);

}  // namespace cli
