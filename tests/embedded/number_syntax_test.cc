#include "fileio/host/text.h"

#include <cmath>
#include <cstring>

#include <gtest/gtest.h>

namespace {

struct Row {
    int line;
    const char* text;
    double value;
    std::size_t consumed;
};

const double infinity = INFINITY;

const Row rows[] = {
    {__LINE__, "", 0, 0},
    {__LINE__, "x", 0, 0},
    {__LINE__, "-", 0, 0},
    {__LINE__, "+-5", 0, 0},
    {__LINE__, " 5", 0, 0},
    {__LINE__, ".", 0, 0},
    {__LINE__, ".e5", 0, 0},
    {__LINE__, "12abc", 12, 2},
    {__LINE__, "+12", 12, 3},
    {__LINE__, "-0", -0.0, 2},
    {__LINE__, ".5.", 0.5, 2},
    {__LINE__, "5.", 5, 2},
    {__LINE__, "1e5", 1e5, 3},
    {__LINE__, "1E+5", 1e5, 4},
    {__LINE__, "1e", 1, 1},
    {__LINE__, "1e+x", 1, 1},
    {__LINE__, "0x10", 0, 1},
    {__LINE__, "1,5", 1, 1},
    {__LINE__, "0.1", 0.1, 3},
    {__LINE__, "1e309", infinity, 5},
    {__LINE__, "-1e99999999999999999999", -infinity, 23},
    {__LINE__, "1e-400", 0, 6},
    {__LINE__, "1e-99999999999999999999", 0, 23},
    {__LINE__, "1234567890e300", infinity, 14},
    {__LINE__, "0.00000000001e-320", 0, 18},
    {__LINE__, "4.9e-324", 4.9e-324, 8},
    {__LINE__, "inf", infinity, 3},
    {__LINE__, "-INFINITYx", -infinity, 9},
    {__LINE__, "+Infinit", infinity, 4},
    {__LINE__, "in", 0, 0},
    {__LINE__, "nan(1)", NAN, 3},
    {__LINE__, "NaN", NAN, 3},
};

TEST(NumberSyntax, LongestMatch) {
    for (const Row& row : rows) {
        SCOPED_TRACE(row.line);
        std::size_t consumed = 99;
        const double value = vxTextToDouble(row.text, std::strlen(row.text), &consumed);
        EXPECT_EQ(consumed, row.consumed);
        if (std::isnan(row.value)) {
            EXPECT_TRUE(std::isnan(value));
        } else {
            EXPECT_EQ(value, row.value);
            EXPECT_EQ(std::signbit(value), std::signbit(row.value));
        }
    }
}

TEST(NumberSyntax, StopsAtTheCountGiven) {
    std::size_t consumed = 0;
    EXPECT_EQ(vxTextToDouble("123456", 3, &consumed), 123);
    EXPECT_EQ(consumed, 3u);
}

}  // namespace
