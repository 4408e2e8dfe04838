#include "fileio/printf/number_text.h"

#include "fileio/printf/number_field.h"

#include <algorithm>
#include <cfenv>
#include <charconv>
#include <cmath>
#include <langinfo.h>
#include <limits>
#include <string_view>

namespace Orvandeil::FileIO::detail {
namespace {

constexpr std::size_t writtenAhead = 40;
constexpr std::size_t mostIntegerDigits = 22;  // 64 bits in octal
constexpr std::size_t mostRealDigits = 309;    // before the point
constexpr std::size_t signPointAndExponent = 8;

constexpr bool isReal(char conversion) {
    const char lower = static_cast<char>(conversion | 0x20);
    return lower >= 'e' && lower <= 'g';
}

constexpr double largestMagnitude = std::numeric_limits<double>::infinity();

// Below it, a value with so many decimals has sixteen digits at most.
double plainLimitOf(int precision) {
    static constexpr double limits[] = {9.99e15, 9.99e14, 9.99e13, 9.99e12, 9.99e11, 9.99e10,
                                        9.99e9,  9.99e8,  9.99e7,  9.99e6,  9.99e5,  9.99e4,
                                        9.99e3,  9.99e2,  9.99e1,  9.99};
    return precision < static_cast<int>(std::size(limits)) ? limits[precision] : 0;
}

char signOf(const NumberForm& form, bool negative) {
    return negative ? '-' : form.positiveSign;
}

// The general layout of a whole number: sign, prefix, zeros up to the precision or the width,
// digits.
char* writeDigits(char* out, const NumberForm& form, char sign, std::string_view prefix,
                  std::string_view digits) {
    const auto wanted = static_cast<std::size_t>(std::max(form.precision, 0));
    const std::size_t zeros = digits.size() < wanted ? wanted - digits.size() : 0;
    const std::size_t length = prefix.size() + zeros + digits.size();
    NumberForm inner = form;
    if (!prefix.empty() && form.zeroFill) {
        // The filling goes behind the prefix.
        out = std::copy(prefix.begin(), prefix.end(), out);
        inner.width -= static_cast<int>(std::min<std::size_t>(prefix.size(), 2));
        inner.width = std::max(inner.width, 0);
        out = openField(out, inner, sign, length - prefix.size());
    } else {
        out = openField(out, inner, sign, length);
        out = std::copy(prefix.begin(), prefix.end(), out);
    }
    out = std::fill_n(out, zeros, '0');
    return std::copy(digits.begin(), digits.end(), out);
}

int decimalLength(unsigned long value) {
    int length = 1;
    for (; value >= 10000; value /= 10000)
        length += 4;
    return length + (value >= 10 ? 1 : 0) + (value >= 100 ? 1 : 0) + (value >= 1000 ? 1 : 0);
}

// Decimal without precision.
char* writeDecimal(char* out, const NumberForm& form, char sign, unsigned long value) {
    char* const begin = out;
    if (value < tenTo8) {
        const std::uint64_t digits = eightDigits(value);
        const int leading = std::min(leadingZeroBytes(digits), 7);
        out = openField(out, form, sign, static_cast<std::size_t>(8 - leading));
        storeBytes(out, (digits | eightZeros) >> 8 * leading);
        out += 8 - leading;
    } else if (value < tenTo16) {
        const Word128 digits = sixteenDigits(value);
        const int leading = leadingZeroBytes(digits);
        out = openField(out, form, sign, static_cast<std::size_t>(16 - leading));
        storeBytes(out, (digits | sixteenZeros) >> 8 * leading);
        out += 16 - leading;
    } else {
        out = openField(out, form, sign, static_cast<std::size_t>(decimalLength(value)));
        out = std::to_chars(out, out + mostIntegerDigits, value).ptr;
    }
    return closeField(begin, out, form);
}

std::string_view prefixOf(const NumberForm& form, unsigned long value) {
    if (!form.alternate || value == 0) return {};
    return form.conversion == 'x' ? "0x" : form.conversion == 'X' ? "0X" : "";
}

char* writeHexDigits(char* out, unsigned long value, bool upper) {
    const char* const letters = upper ? "0123456789ABCDEF" : "0123456789abcdef";
    const int count = hexLength(value);
    for (int i = count; i-- != 0; value >>= 4)
        out[i] = letters[value & 15];
    return out + count;
}

char* writeShortHex(char* out, const NumberForm& form, unsigned long value) {
    char* const begin = out;
    const int count = hexLength(value);
    out = openField(out, form, 0, static_cast<std::size_t>(count));
    storeBytes(out, eightHexDigits(value, form.conversion == 'X') >> 8 * (8 - count));
    return closeField(begin, out + count, form);
}

// Every form of a magnitude.
char* writeWhole(char* out, const NumberForm& form, char sign, unsigned long value) {
    char digits[mostIntegerDigits + 1];
    char* end = digits;
    if (form.conversion == 'd' || form.conversion == 'u') {
        end = std::to_chars(digits, std::end(digits), value).ptr;
    } else if (form.conversion == 'o') {
        end = std::to_chars(digits, std::end(digits), value, 8).ptr;
    } else {
        end = writeHexDigits(digits, value, form.conversion == 'X');
    }
    const auto count = static_cast<std::size_t>(end - digits);
    std::string_view text = {digits, value == 0 && form.precision == 0 ? 0 : count};
    std::string_view prefix = prefixOf(form, value);
    const bool zeroInFront = form.precision > static_cast<int>(text.size()) || text == "0";
    if (form.alternate && form.conversion == 'o' && !zeroInFront) prefix = "0";
    // An octal prefix is one of the zeros that the filling puts there.
    if (prefix == "0" && form.zeroFill && static_cast<int>(text.size()) < form.width) prefix = {};
    char* const begin = out;
    out = writeDigits(out, form, sign, prefix, text);
    return closeField(begin, out, form);
}

}  // namespace

NumberForm makeNumberForm(char conversion, PrintFormatFlags flags, int width, bool hasPrecision,
                          int precision) {
    NumberForm form = {};
    if (conversion == 'i') conversion = 'd';
    form.conversion = conversion;
    form.leftJustify = (flags & LeftJustify) != 0;
    form.alternate = (flags & Alternate) != 0;
    form.width = width;
    const bool real = isReal(conversion);
    if (real || conversion == 'd') {
        form.positiveSign = (flags & ShowSign) != 0 ? '+' : (flags & SpaceSign) != 0 ? ' ' : '\0';
    }
    form.zeroFill = (flags & ZeroPad) != 0 && !form.leftJustify && (real || !hasPrecision);
    form.precision = hasPrecision ? precision : real ? 6 : -1;
    const bool general = conversion == 'g' || conversion == 'G';
    if (general && form.precision == 0) form.precision = 1;
    form.plainLimit = conversion == 'f' ? plainLimitOf(form.precision) : largestMagnitude;
    form.bare = !real && flags == NoFlags && width == 0 && !hasPrecision;
    form.mostBytes = static_cast<std::size_t>(width) +
                     static_cast<std::size_t>(std::max(form.precision, 0)) +
                     (conversion == 'f' ? mostRealDigits : mostIntegerDigits) +
                     signPointAndExponent + writtenAhead;
    return form;
}

bool isKnownForm(const NumberForm& form) {
    if (form.width > largestField || form.precision > largestField) return false;
    const bool general = form.conversion == 'g' || form.conversion == 'G';
    return !(form.alternate && isReal(form.conversion) && (general || form.precision == 0));
}

bool writesAsPrintf() {
    return std::fegetround() == FE_TONEAREST && std::strcmp(nl_langinfo(RADIXCHAR), ".") == 0;
}

char* writeSigned(char* out, const NumberForm& form, long value) {
    const char sign = signOf(form, value < 0);
    const auto bits = static_cast<unsigned long>(value);
    const unsigned long magnitude = value < 0 ? 0 - bits : bits;
    if (form.precision < 0) return writeDecimal(out, form, sign, magnitude);
    return writeWhole(out, form, sign, magnitude);
}

char* writeUnsigned(char* out, const NumberForm& form, unsigned long value) {
    if (form.precision < 0 && !form.alternate && form.conversion != 'o') {
        if (form.conversion == 'u') return writeDecimal(out, form, 0, value);
        if (value >> 32 == 0) return writeShortHex(out, form, value);
    }
    return writeWhole(out, form, 0, value);
}

char* writeNonFinite(char* out, const NumberForm& form, double value) {
    NumberForm padded = form;
    padded.zeroFill = false;
    const std::string_view text = std::isnan(value) ? "NaN" : "Inf";
    const char sign = std::isnan(value) ? '\0' : signOf(form, value < 0);
    char* const begin = out;
    out = openField(out, padded, sign, text.size());
    return closeField(begin, std::copy(text.begin(), text.end(), out), padded);
}

}  // namespace Orvandeil::FileIO::detail
