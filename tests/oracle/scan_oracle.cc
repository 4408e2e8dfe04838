#include "tests/oracle/scan_oracle.h"

#include <algorithm>
#include <bit>
#include <cerrno>
#include <cmath>
#include <cstdlib>
#include <cstring>
#include <vector>

namespace oracle {
namespace {

using Orvandeil::FileIO::stream;
using namespace std::literals;

const std::string hexSet = "[0-9a-fA-F]";

bool isSign(int c) {
    return c == '-' || c == '+';
}

int nextBehindBlanks(std::FILE* file) {
    int c;
    do {
        c = std::getc(file);
    } while (c > 0 && std::strchr(" \t\n\v\f\r", c));
    return c;
}

void giveBack(std::FILE* file, std::string read) {
    for (; !read.empty(); read.pop_back())
        std::ungetc(static_cast<unsigned char>(read.back()), file);
}

int failureCode(std::FILE* file) {
    return errno != 0 ? errno : std::ferror(file) ? -1 : 0;
}

std::string digitsOf(long width) {
    return width < 0 ? "" : std::to_string(std::min<long>(width, INT_MAX));
}

// The characters that "%*<width>[<set>]%n" takes, with no width when it is negative.
long skip(std::FILE* file, long width, const std::string& set) {
    int taken = 0;
    const std::string format = "%*" + digitsOf(width) + set + "%n";
    return std::fscanf(file, format.c_str(), &taken) == EOF ? 0 : taken;
}

// Appends what "%<width>[<set>]" takes; false when nothing matched.
bool read(std::FILE* file, long width, const std::string& set, std::string& field) {
    char digits[64];
    errno = 0;
    if (std::fscanf(file, ("%" + digitsOf(width) + set).c_str(), digits) != 1) return false;
    field += digits;
    return true;
}

// A field's sign, prefix and digits, the latter without leading zeros and what is too much of them;
// false when there is no number.
bool collect(std::FILE* file, Operation operation, long width, std::string& field) {
    errno = 0;
    std::string set = operation == Octal ? "[0-7]" : operation == Hex ? hexSet : "[0-9]";
    int c = nextBehindBlanks(file);
    if (isSign(c)) {
        field += static_cast<char>(c);
        c = std::getc(file);
    }
    const bool zero = c == '0';
    const bool mayBeHex = operation == Hex || operation == CouldBeHex;
    if (zero) field += '0';
    if (zero && mayBeHex) c = std::getc(file);
    const bool prefix = zero && (c == 'x' || c == 'X');
    if (prefix) field += static_cast<char>(c);
    if (!prefix && (!zero || mayBeHex)) std::ungetc(c, file);
    if (zero && operation == CouldBeHex) set = prefix ? hexSet : "[0-7]";

    const bool skipZeros = zero && !(operation == Hex && prefix);
    const long kept = static_cast<long>(field.size());
    if (width >= 0 && width <= 24) {
        if (width < kept || (width == kept && !zero)) return false;
        return width == kept || read(file, width - kept, set, field) || zero;
    }
    long surplus = width < 0 ? -1 : width - 24;
    if (skipZeros) surplus -= skip(file, surplus, "[0]");
    if (!read(file, width < 0 ? 22 : 24 - kept, set, field)) return zero;
    if (surplus != 0) skip(file, width < 0 ? -1 : surplus, set);
    return true;
}

Outcome floatingNumber(std::FILE* file, long width, int sign, int& errorCode) {
    errno = 0;
    double value = 0;
    const std::string format = "%" + digitsOf(width) + "le";
    if (width != 0 && std::fscanf(file, format.c_str(), &value) == 1)
        return {std::bit_cast<unsigned long>(value)};
    if (width != 0 && sign != 0) std::ungetc(sign, file);
    return {0, errorCode = failureCode(file)};
}

Outcome floating(std::FILE* file, long width, int status, int& errorCode) {
    errno = 0;
    std::string field;
    int c = nextBehindBlanks(file);
    const int sign = isSign(c) ? c : 0;
    if (sign != 0) {
        field += static_cast<char>(c);
        c = std::getc(file);
    }
    const std::string word = c == 'i' || c == 'I' ? "inf" : c == 'n' || c == 'N' ? "nan" : "";
    if (c != EOF) field += static_cast<char>(c);
    bool matches = !word.empty();
    for (std::size_t i = 1; matches && i < word.size(); ++i) {
        c = std::getc(file);
        if (c != EOF) field += static_cast<char>(c);
        matches = c == word[i] || c == word[i] - 'a' + 'A';
    }
    if (matches && status == INT_MAX) {
        const double infinity = sign == '-' ? -INFINITY : INFINITY;
        return {word == "inf" ? std::bit_cast<unsigned long>(infinity) : 0xFFF8000000000000};
    }
    giveBack(file, field);
    if (!word.empty() && !matches) status = -1;
    if (word.empty() || status == 0) return floatingNumber(file, width, sign, errorCode);
    return {std::bit_cast<unsigned long>(-1.0), status};
}

}  // namespace

std::string Outcome::describe() const {
    char text[80];
    std::snprintf(text, sizeof text, "value %#lx status %d flag %d", bits, status, flag);
    return text;
}

Outcome scanWith(stream& from, Operation operation, long width, int status, bool flag) {
    Outcome out{0, status, flag};
    if (operation == Float) {
        out.bits = std::bit_cast<unsigned long>(from.scanFloat(width, out.status));
    } else if (operation == Integer || operation == CouldBeHex) {
        const auto scan =
            operation == Integer ? &stream::scanInteger : &stream::scanIntegerCouldBeHex;
        out.bits = static_cast<unsigned long>((from.*scan)(width, out.status));
    } else {
        const auto scan = operation == Octal ? &stream::scanOctal
                          : operation == Hex ? &stream::scanHex
                                             : &stream::scanUnsignedInteger;
        out.bits = (from.*scan)(width, out.status, out.flag);
    }
    return out;
}

Outcome wholeNumber(Operation operation, const char* field, char** end) {
    constexpr int bases[] = {10, 0, 10, 8, 16};
    errno = 0;
    if (operation == Integer || operation == CouldBeHex)
        return {static_cast<unsigned long>(std::strtoll(field, end, bases[operation]))};
    const unsigned long value = std::strtoull(field, end, bases[operation]);
    const bool flag = field[0] == '-' && value != 0;
    return {flag && errno == ERANGE ? 0 : value, INT_MAX, flag};
}

Outcome scanByFscanf(std::FILE* file, Operation operation, long width, int status, int& errorCode) {
    if (operation == Float) return floating(file, width, status, errorCode);
    std::string field;
    const bool collected = collect(file, operation, width, field);
    const bool flag = operation == Hex && field[0] == '-';
    if (!collected) {
        giveBack(file, field);
        return {0, errorCode = failureCode(file), flag};
    }
    if (flag) return {std::strtoull(field.c_str(), nullptr, 16), INT_MAX, true};
    return wholeNumber(operation, field.c_str(), nullptr);
}

long Fields::width() {
    static constexpr long special[] = {0, 999, 2147483647, 1L << 40, LONG_MAX};
    if (input.below(3) == 0) return -1;
    return input.below(8) == 0 ? input.of(special) : static_cast<long>(1 + input.below(30));
}

std::string Fields::text(std::size_t tokens) {
    static const std::vector<std::string> special = properties::split(
        "-0|0x|-0x|0X1|inf|-nan|in|na|INF|NaN|1e+|1e5|1.|.5|0b1|-.|e-| -|0x.|+0|e+9|0x1e|"
        "1e999|e-999|infinity|9223372036854775807|9223372036854775808|"
        "-9223372036854775808|-9223372036854775809|18446744073709551615|"
        "18446744073709551616|-18446744073709551615|-18446744073709551616|"
        "0x7fffffffffffffff|0x8000000000000000|0777777777777777777777|"
        "01777777777777777777777");
    std::string result;
    for (std::size_t i = 0; i < tokens; ++i) {
        const std::size_t kind = input.below(12), number = input.below(64);
        result += kind < 3    ? input.of(special)
                  : kind == 3 ? std::string(20 + number, input.of("0179af"sv))
                  : kind == 4 ? std::to_string(input.number(8) >> number)
                              : std::string(1, input.of(" \t\n\0\xFF+-0017789aefinpx.,"sv));
    }
    return result;
}

}  // namespace oracle
