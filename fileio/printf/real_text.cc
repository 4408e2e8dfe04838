#include "fileio/printf/number_field.h"
#include "fileio/printf/scaled_decimal.h"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <iterator>

namespace Orvandeil::FileIO::detail {
namespace {

constexpr int wordDigits = 16;

// The significant digits of a value as numbers 0 to 9, the first of them in the lowest byte and
// zeros behind the last; the first stands for 10^exponent.
struct Significant {
    Word128 digits;
    int exponent;
    bool certain;
};

consteval std::uint64_t tenToNth(int n) {
    std::uint64_t power = 1;
    for (; n != 0; --n)
        power *= 10;
    return power;
}
constexpr std::uint64_t powers[] = {
    tenToNth(0),  tenToNth(1),  tenToNth(2),  tenToNth(3),  tenToNth(4),  tenToNth(5),
    tenToNth(6),  tenToNth(7),  tenToNth(8),  tenToNth(9),  tenToNth(10), tenToNth(11),
    tenToNth(12), tenToNth(13), tenToNth(14), tenToNth(15), tenToNth(16)};

Word128 leftAligned(std::uint64_t number, int count) {
    if (count <= 8) return eightDigits(number) >> 8 * (8 - count);
    return sixteenDigits(number) >> 8 * (wordDigits - count);
}

Significant significantDigits(double magnitude, int count) {
    if (magnitude == 0) return {0, 0, true};
    const Binary value = decompose(magnitude);
    const int exponent = decimalExponent(value);
    const auto [number, certain] = scaleAndRound(value, count - 1 - exponent);
    // Rounded up to one more digit: a one and zeros.
    if (number == powers[count]) return {1, exponent + 1, certain};
    return {leftAligned(number, count), exponent, certain};
}

char signOf(const NumberForm& form, double value) {
    return std::signbit(value) ? '-' : form.positiveSign;
}

char* writeExponent(char* out, char letter, int exponent) {
    *out++ = letter;
    *out++ = exponent < 0 ? '-' : '+';
    const int magnitude = std::abs(exponent);
    if (magnitude >= 100) *out++ = static_cast<char>('0' + magnitude / 100);
    *out++ = static_cast<char>('0' + magnitude / 10 % 10);
    *out++ = static_cast<char>('0' + magnitude % 10);
    return out;
}

// One digit, the point, the others, and the exponent.
char* writeScientific(char* out, const NumberForm& form, char sign, const Significant& value,
                      int count) {
    char* const begin = out;
    const std::size_t digitsLength = static_cast<std::size_t>(count) + (count > 1 ? 1 : 0);
    const std::size_t exponentLength = std::abs(value.exponent) >= 100 ? 5 : 4;
    out = openField(out, form, sign, digitsLength + exponentLength);
    const Word128 text = value.digits | sixteenZeros;
    *out = static_cast<char>(static_cast<unsigned char>(text));
    out[1] = '.';
    storeBytes(out + 2, text >> 8);
    // The letters of the general form are those of its exponent, two before them.
    const char letter = form.conversion == 'e' || form.conversion == 'g' ? 'e' : 'E';
    return closeField(begin, writeExponent(out + digitsLength, letter, value.exponent), form);
}

// `before` digits, the point, the rest of `count` digits, which are at most as many as the word
// has.
template <class Word>
char* writePointed(char* out, const NumberForm& form, char sign, Word text, int before, int count) {
    char* const begin = out;
    const bool point = count > before;
    const int length = std::max(count, before) + (point ? 1 : 0);
    out = openField(out, form, sign, static_cast<std::size_t>(length));
    storeBytes(out, text);
    if (point) {
        out[before] = '.';
        storeBytes(out + before + 1, text >> 8 * before);
    }
    return closeField(begin, out + length, form);
}

// "0.", zeros, and the digits of a value below 1 and not below 0.0001.
char* writeSmall(char* out, const NumberForm& form, char sign, const Significant& value,
                 int count) {
    char* const begin = out;
    const int zeros = -value.exponent - 1;
    const int length = 2 + zeros + count;
    out = openField(out, form, sign, static_cast<std::size_t>(length));
    storeBytes(out, eightZeros);
    out[1] = '.';
    storeBytes(out + 2 + zeros, value.digits | sixteenZeros);
    return closeField(begin, out + length, form);
}

// The standard library's digits in a field of the form.
char* writeByLibrary(char* out, const NumberForm& form, double value) {
    const char conversion = static_cast<char>(form.conversion | 0x20);
    const auto format = conversion == 'e'   ? std::chars_format::scientific
                        : conversion == 'f' ? std::chars_format::fixed
                                            : std::chars_format::general;
    char digits[512];
    char* const end =
        std::to_chars(digits, std::end(digits), std::abs(value), format, form.precision).ptr;
    if (form.conversion < 'a') std::replace(digits, end, 'e', 'E');
    char* const begin = out;
    out = openField(out, form, signOf(form, value), static_cast<std::size_t>(end - digits));
    return closeField(begin, std::copy(digits, end, out), form);
}

// All digits of a word, the decimals last, less the zeros in front; one stays before the point.
template <class Word>
char* writeFixedDigits(char* out, const NumberForm& form, char sign, Word digits) {
    constexpr int count = sizeof(Word);
    const int before = count - form.precision;
    const int leading = std::min(leadingZeroBytes(digits), before - 1);
    const Word text = (digits | static_cast<Word>(sixteenZeros)) >> 8 * leading;
    return writePointed(out, form, sign, text, before - leading, count - leading);
}

char* writeFixed(char* out, const NumberForm& form, double value) {
    const double magnitude = std::abs(value);
    if (!(magnitude < form.plainLimit)) return writeByLibrary(out, form, value);
    Scaled scaled = {0, true};
    if (magnitude != 0) scaled = scaleAndRound(decompose(magnitude), form.precision);
    if (!scaled.certain) return writeByLibrary(out, form, value);
    if (scaled.number < tenTo8 && form.precision < 8) {
        return writeFixedDigits(out, form, signOf(form, value), eightDigits(scaled.number));
    }
    return writeFixedDigits(out, form, signOf(form, value), sixteenDigits(scaled.number));
}

char* writeWithExponent(char* out, const NumberForm& form, double value) {
    const int count = form.precision + 1;
    if (count > wordDigits) return writeByLibrary(out, form, value);
    const Significant digits = significantDigits(std::abs(value), count);
    if (!digits.certain) return writeByLibrary(out, form, value);
    return writeScientific(out, form, signOf(form, value), digits, count);
}

char* writeGeneral(char* out, const NumberForm& form, double value) {
    if (form.precision > wordDigits) return writeByLibrary(out, form, value);
    const Significant digits = significantDigits(std::abs(value), form.precision);
    if (!digits.certain) return writeByLibrary(out, form, value);
    const char sign = signOf(form, value);
    const int count = std::max(significantBytes(digits.digits), 1);
    constexpr int smallestPlain = -4;
    if (digits.exponent >= form.precision || digits.exponent < smallestPlain) {
        return writeScientific(out, form, sign, digits, count);
    }
    if (digits.exponent < 0) return writeSmall(out, form, sign, digits, count);
    return writePointed(out, form, sign, digits.digits | sixteenZeros, digits.exponent + 1, count);
}

}  // namespace

char* writeReal(char* out, const NumberForm& form, double value) {
    switch (form.conversion) {
        case 'f':
            return writeFixed(out, form, value);
        case 'e':
        case 'E':
            return writeWithExponent(out, form, value);
        default:
            return writeGeneral(out, form, value);
    }
}

}  // namespace Orvandeil::FileIO::detail
