#include "fileio/host/text.h"
#include "fileio/text/input_string_stream.h"
#include "tests/oracle/scan_oracle.h"

#include <algorithm>
#include <bit>
#include <cstdio>
#include <cstdlib>

#include <gtest/gtest.h>

namespace {

using namespace oracle;

bool isBlank(char byte) {
    return byte == '\0' ||
           qzu_isbreakablespace(static_cast<char16_t>(static_cast<signed char>(byte)));
}

double referenceFloat(const std::string& text, long& taken) {
    const std::size_t digits = text.find_first_not_of("+-");
    double value = 0;
    if (digits <= 1 && (text.compare(digits, 2, "0x") == 0 || text.compare(digits, 2, "0X") == 0)) {
        auto n = static_cast<std::size_t>(std::find_if(text.begin(), text.end(), isBlank) -
                                          text.begin());
        if (text[n - 1] == 'e' || text[n - 1] == 'E') --n;
        std::sscanf(text.c_str(), ("%" + std::to_string(n) + "le%ln").c_str(), &value, &taken);
    } else {
        char* end = nullptr;
        value = std::strtod(text.c_str(), &end);
        taken = end - text.c_str();
    }
    return value;
}

std::string describe(const Outcome& out, long position) {
    return out.describe() + " at " + std::to_string(position);
}

// The C library's own functions over a terminated copy of the field. The flag begins as true.
std::string reference(Operation operation, const std::string& text, long width) {
    const auto blanks = std::find_if_not(text.begin(), text.end(), isBlank) - text.begin();
    if (blanks == std::ssize(text)) return describe({0, 0, true}, blanks);
    const std::string field =
        text.substr(static_cast<std::size_t>(blanks), static_cast<std::size_t>(width));
    Outcome out;
    long taken = 0;
    if (operation == Float) {
        out.bits = std::bit_cast<unsigned long>(referenceFloat(field, taken));
    } else {
        char* end = nullptr;
        out = wholeNumber(operation, field.c_str(), &end);
        taken = end - field.c_str();
    }
    if (taken == 0) out.status = -9;
    if (operation == Integer || operation == CouldBeHex || operation == Float) out.flag = true;
    return describe(out, blanks + taken);
}

void expectAsReference(Operation operation, const std::string& text, long width) {
    Orvandeil::FileIO::inputStringStream stream(text.c_str(), std::ssize(text), "");
    const Outcome out = scanWith(stream, operation, width, INT_MAX, true);
    long position = -1;
    stream.getPosition(position);
    EXPECT_EQ(describe(out, position), reference(operation, text, width))
        << "operation " << operation << " of \"" << text << "\", width " << width;
}

TEST(TextScan, AgreesWithTheStandardLibrary) {
    Fields fields(7);
    for (int round = 0; round < 100000 && !HasFailure(); ++round)
        expectAsReference(fields.operation(), fields.text(fields.below(8)), fields.width());
}

}  // namespace
