#include "fileio/host/text.h"
#include "fileio/text/input_string_stream.h"

#include <cerrno>
#include <climits>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <random>

#include <gtest/gtest.h>

namespace Orvandeil::FileIO {
namespace {

using namespace std::string_literals;

enum Operation { Integer, CouldBeHex, Unsigned, Octal, Hex, Float, operationCount };
const char* const names[] = {
    "scanInteger", "scanIntegerCouldBeHex", "scanUnsignedInteger", "scanOctal", "scanHex",
    "scanFloat"};
constexpr int bases[] = {10, 0, 10, 8, 16};
constexpr int untouched = 2147483647;

struct Outcome {
    unsigned long value = 0;  // the bits
    int status = untouched;
    int flag = -1;  // -1: untouched
    long position = 0;
    bool operator==(const Outcome&) const = default;
};

std::ostream& operator<<(std::ostream& out, const Outcome& it) {
    return out << "value " << it.value << " status " << it.status << " flag " << it.flag << " at "
               << it.position;
}

unsigned long bitsOf(double value) {
    unsigned long bits = 0;
    std::memcpy(&bits, &value, sizeof value);
    return bits;
}

bool isBlank(char byte) {
    return byte == '\0' ||
           qzu_isbreakablespace(static_cast<char16_t>(static_cast<signed char>(byte)));
}

// The reference: the C library's own functions over a terminated copy.
unsigned long referenceInteger(Operation operation, const std::string& text, long& taken,
                               int& flag) {
    char* end = nullptr;
    errno = 0;
    unsigned long value = 0;
    if (operation == Integer || operation == CouldBeHex) {
        value = static_cast<unsigned long>(std::strtoll(text.c_str(), &end, bases[operation]));
    } else {
        value = std::strtoull(text.c_str(), &end, bases[operation]);
        flag = text[0] == '-' && value != 0;
        if (flag && errno == ERANGE) value = 0;
    }
    taken = end - text.c_str();
    return value;
}

double referenceFloat(const std::string& text, long& taken) {
    const std::size_t digits = text.find_first_not_of("+-");
    const bool hex =
        digits <= 1 && (text.compare(digits, 2, "0x") == 0 || text.compare(digits, 2, "0X") == 0);
    if (!hex) {
        char* end = nullptr;
        const double value = std::strtod(text.c_str(), &end);
        taken = end - text.c_str();
        return value;
    }
    int n = 0;
    while (!isBlank(text[static_cast<std::size_t>(n)]))
        ++n;
    const char last = text[static_cast<std::size_t>(n) - 1];
    if (last == 'e' || last == 'E') --n;
    double value = 0;
    int count = INT_MIN;
    std::sscanf(text.c_str(), ("%" + std::to_string(n) + "le%n").c_str(), &value, &count);
    taken = count == INT_MIN ? 0 : count;
    return value;
}

Outcome reference(Operation operation, const std::string& text, long width) {
    Outcome out;
    std::size_t at = 0;
    while (at < text.size() && isBlank(text[at]))
        ++at;
    out.position = static_cast<long>(at);
    if (at == text.size()) {
        out.status = 0;
        return out;
    }
    const std::string field =
        text.substr(at, width < 0 ? text.npos : static_cast<std::size_t>(width));
    long taken = 0;
    out.value = operation == Float ? bitsOf(referenceFloat(field, taken))
                                   : referenceInteger(operation, field, taken, out.flag);
    if (taken == 0) out.status = -9;
    out.position += taken;
    return out;
}

Outcome scanned(Operation operation, const std::string& text, long width) {
    inputStringStream stream(text.c_str(), static_cast<long>(text.size()), "");
    Outcome out;
    bool flag = false;
    bool other = true;  // both values, so that an untouched flag shows
    const auto scan = [&](bool& minus) -> unsigned long {
        stream.Rewind(text.size());
        switch (operation) {
            case Integer:
                return static_cast<unsigned long>(stream.scanInteger(width, out.status));
            case CouldBeHex:
                return static_cast<unsigned long>(stream.scanIntegerCouldBeHex(width, out.status));
            case Unsigned:
                return stream.scanUnsignedInteger(width, out.status, minus);
            case Octal:
                return stream.scanOctal(width, out.status, minus);
            case Hex:
                return stream.scanHex(width, out.status, minus);
            default:
                return bitsOf(stream.scanFloat(width, out.status));
        }
    };
    out.value = scan(flag);
    scan(other);
    if (flag == other) out.flag = flag;
    stream.getPosition(out.position);
    return out;
}

void expectAsReference(Operation operation, const std::string& text, long width) {
    EXPECT_EQ(scanned(operation, text, width), reference(operation, text, width))
        << names[operation] << " of \"" << text << "\", width " << width;
}

std::string randomText(std::mt19937& random) {
    static const std::string pieces[] = {
        " ",   "\t", "\n", "\0"s, "-",   "+",   "0",        "0x",   "0X",   "x",     "1",     "7",
        "8",   "9",  "a",  "e",   "E",   "f",   ".",        ",",    "p",    "1e5",   "e-",    "inf",
        "nan", "na", "i",  "1.5", "e+9", "INF", "infinity", "\xFF", "0x1e", "1e999", "1e-999"};
    std::string text;
    for (unsigned count = random() % 8; count > 0; --count) {
        text += pieces[random() % std::size(pieces)];
        if (random() % 20 == 0) text.append(20 + random() % 41, "0179fF"[random() % 6]);
    }
    return text;
}

TEST(TextScan, AgreesWithTheStandardLibrary) {
    std::mt19937 random(7);
    for (int round = 0; round < 40000; ++round) {
        const std::string text = randomText(random);
        const long width = static_cast<long>(random() % 48) - 16;
        for (int operation = 0; operation < operationCount; ++operation) {
            expectAsReference(static_cast<Operation>(operation), text, std::max(width, -1L));
        }
        if (HasFailure()) break;
    }
}

TEST(TextScan, ClampsAtTheLimits) {
    for (const char* text :
         {"9223372036854775807", "9223372036854775808", "-9223372036854775808",
          "-9223372036854775809", "18446744073709551615", "18446744073709551616",
          "-18446744073709551615", "-18446744073709551616", "-0", "0x7fffffffffffffff",
          "0x8000000000000000", "-0xffffffffffffffffff", "0777777777777777777777",
          "01777777777777777777777", "1777777777777777777777", "2000000000000000000000"}) {
        for (const Operation operation : {Integer, CouldBeHex, Unsigned, Octal, Hex}) {
            expectAsReference(operation, text, -1);
        }
    }
}

TEST(TextScan, TellsEndMismatchAndMinusApart) {
    const struct {
        int line;
        Operation operation;
        std::string text;
        long width;
        Outcome outcome;
    } cases[] = {
        {__LINE__, Integer, " \0\n "s, -1, {0, 0, -1, 4}},
        {__LINE__, Unsigned, " \0"s, -1, {0, 0, -1, 2}},
        {__LINE__, Unsigned, "-0", -1, {0, untouched, 0, 2}},
        {__LINE__, Unsigned, "-18446744073709551616", -1, {0, untouched, 1, 21}},
        {__LINE__, Unsigned, "-5", -1, {0UL - 5, untouched, 1, 2}},
        {__LINE__, Integer, "12345", 3, {123, untouched, -1, 3}},
        {__LINE__, Integer, "1", 0, {0, -9, -1, 0}},
        {__LINE__, Integer, " x", -1, {0, -9, -1, 1}},
        {__LINE__, CouldBeHex, "0xg", -1, {0, untouched, -1, 1}},
        {__LINE__, CouldBeHex, "0b1", -1, {0, untouched, -1, 1}},
        {__LINE__,
         Integer,
         "\xA0"
         "5",
         -1,
         {0, -9, -1, 0}},
        {__LINE__, Float, "0x1e", -1, {bitsOf(1), untouched, -1, 3}},
        {__LINE__, Float, "0x10,7", -1, {bitsOf(16), untouched, -1, 4}},
        {__LINE__, Float, "-", -1, {0, -9, -1, 0}},
        {__LINE__, Float, "-inf", 4, {bitsOf(-INFINITY), untouched, -1, 4}},
    };
    for (const auto& row : cases) {
        EXPECT_EQ(scanned(row.operation, row.text, row.width), row.outcome) << "line " << row.line;
    }
}

}  // namespace
}  // namespace Orvandeil::FileIO
