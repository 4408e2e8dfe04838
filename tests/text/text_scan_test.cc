#include "fileio/host/text.h"
#include "fileio/text/input_string_stream.h"

#include <bit>
#include <cerrno>
#include <climits>
#include <cstdio>
#include <cstdlib>
#include <random>
#include <tuple>

#include <gtest/gtest.h>

namespace Orvandeil::FileIO {
namespace {

using namespace std::string_literals;

enum Operation { Integer, CouldBeHex, Unsigned, Octal, Hex, Float, operationCount };
constexpr int bases[] = {10, 0, 10, 8, 16};
constexpr int untouched = 2147483647;

// The value's bits, status, flag and position.
using Outcome = std::tuple<unsigned long, int, bool, long>;

bool isBlank(char byte) {
    return byte == '\0' ||
           qzu_isbreakablespace(static_cast<char16_t>(static_cast<signed char>(byte)));
}

double referenceFloat(const std::string& text, long& taken) {
    const std::size_t digits = text.find_first_not_of("+-");
    if (digits > 1 || (text.compare(digits, 2, "0x") != 0 && text.compare(digits, 2, "0X") != 0)) {
        char* end = nullptr;
        const double value = std::strtod(text.c_str(), &end);
        taken = end - text.c_str();
        return value;
    }
    std::size_t n = 0;
    while (!isBlank(text[n]))
        ++n;
    if (text[n - 1] == 'e' || text[n - 1] == 'E') --n;
    double value = 0;
    int count = INT_MIN;
    std::sscanf(text.c_str(), ("%" + std::to_string(n) + "le%n").c_str(), &value, &count);
    taken = count == INT_MIN ? 0 : count;
    return value;
}

// The C library's own functions over a terminated copy of the field. The flag begins as true.
Outcome reference(Operation operation, const std::string& text, long width) {
    std::size_t at = 0;
    while (at < text.size() && isBlank(text[at]))
        ++at;
    if (at == text.size()) return {0, 0, true, static_cast<long>(at)};
    const std::string field = text.substr(at, static_cast<std::size_t>(width));
    unsigned long value = 0;
    bool flag = true;
    long taken = 0;
    char* end = nullptr;
    errno = 0;
    if (operation == Float) {
        value = std::bit_cast<unsigned long>(referenceFloat(field, taken));
    } else if (operation == Integer || operation == CouldBeHex) {
        value = static_cast<unsigned long>(std::strtoll(field.c_str(), &end, bases[operation]));
    } else {
        value = std::strtoull(field.c_str(), &end, bases[operation]);
        flag = field[0] == '-' && value != 0;
        if (flag && errno == ERANGE) value = 0;
    }
    if (end) taken = end - field.c_str();
    return {value, taken == 0 ? -9 : untouched, flag, static_cast<long>(at) + taken};
}

Outcome scanned(Operation operation, const std::string& text, long width) {
    inputStringStream stream(text.c_str(), static_cast<long>(text.size()), "");
    int status = untouched;
    bool flag = true;
    long position = -1;
    unsigned long value = 0;
    switch (operation) {
        case Integer:
            value = static_cast<unsigned long>(stream.scanInteger(width, status));
            break;
        case CouldBeHex:
            value = static_cast<unsigned long>(stream.scanIntegerCouldBeHex(width, status));
            break;
        case Float:
            value = std::bit_cast<unsigned long>(stream.scanFloat(width, status));
            break;
        default:
            const auto scan = operation == Unsigned ? &inputStringStream::scanUnsignedInteger
                              : operation == Octal  ? &inputStringStream::scanOctal
                                                    : &inputStringStream::scanHex;
            value = (stream.*scan)(width, status, flag);
    }
    stream.getPosition(position);
    return {value, status, flag, position};
}

void expectAsReference(Operation operation, const std::string& text, long width) {
    EXPECT_EQ(scanned(operation, text, width), reference(operation, text, width))
        << "operation " << operation << " of \"" << text << "\", width " << width;
}

std::string randomText(std::mt19937& random) {
    static const std::string pieces[] = {
        " ",   "\t", "\n", "\0"s, "-",   "+",   "0",        "0x",   "0X",   "x",     "1",    "7",
        "8",   "9",  "a",  "e",   "E",   "f",   ".",        ",",    "p",    "1e5",   "e-",   "inf",
        "nan", "na", "i",  "1.5", "e+9", "INF", "infinity", "\xFF", "0x1e", "1e999", "e-999"};
    std::string text;
    for (unsigned count = random() % 8; count > 0; --count) {
        text += pieces[random() % std::size(pieces)];
        if (random() % 20 == 0) text.append(20 + random() % 41, "0179fF"[random() % 6]);
    }
    return text;
}

TEST(TextScan, AgreesWithTheStandardLibrary) {
    std::mt19937 random(7);
    for (int round = 0; round < 40000 && !HasFailure(); ++round) {
        const std::string text = randomText(random);
        const long width = std::max(-1L, static_cast<long>(random() % 48) - 16);
        for (int operation = 0; operation < operationCount; ++operation) {
            expectAsReference(static_cast<Operation>(operation), text, width);
        }
    }
    for (const char* text :
         {"9223372036854775807", "9223372036854775808", "-9223372036854775808",
          "-9223372036854775809", "18446744073709551615", "18446744073709551616",
          "-18446744073709551615", "-18446744073709551616", "-0", "0x7fffffffffffffff",
          "0x8000000000000000", "-0xffffffffffffffffff", "0777777777777777777777",
          "01777777777777777777777", "2000000000000000000000"}) {
        for (const Operation operation : {Integer, CouldBeHex, Unsigned, Octal, Hex}) {
            expectAsReference(operation, text, -1);
        }
    }
}

TEST(TextScan, TakesNoMoreThanANumber) {
    const struct {
        int line;
        Operation operation;
        std::string text;
        long width;
        Outcome outcome;
    } cases[] = {
        {__LINE__, Unsigned, " \0\n"s, -1, {0, 0, true, 3}},
        {__LINE__, Unsigned, "-18446744073709551616", -1, {0, untouched, true, 21}},
        {__LINE__, Unsigned, "-0", -1, {0, untouched, false, 2}},
        {__LINE__, Integer, "12345", 3, {123, untouched, true, 3}},
        {__LINE__, Integer, "1", 0, {0, -9, true, 0}},
        {__LINE__, CouldBeHex, "0b1", -1, {0, untouched, true, 1}},  // whatever C version
        {__LINE__, Float, "0x1e", -1, {std::bit_cast<unsigned long>(1.0), untouched, true, 3}},
    };
    for (const auto& row : cases) {
        EXPECT_EQ(scanned(row.operation, row.text, row.width), row.outcome) << "line " << row.line;
    }
}

}  // namespace
}  // namespace Orvandeil::FileIO
