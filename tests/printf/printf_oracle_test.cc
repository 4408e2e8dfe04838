#include "tests/support/printing.h"

#include <array>
#include <cstdio>
#include <limits>

#include <gtest/gtest.h>

using namespace Orvandeil::FileIO::embedded;

namespace {

template <class... Arguments>
std::string formatted(const std::string& format, Arguments... arguments) {
    std::array<char, 2048> text{};
    std::snprintf(text.data(), text.size(), format.c_str(), arguments...);
    return text.data();
}

// Each class prints the values it can hold exactly, up to its ends, and nothing ever wraps.
TEST(PrintfOracle, EndsOfEveryIntegerClass) {
    const auto check = [](auto value, vxClassID classID) {
        const ArrayPtr argument = makeRow(classID, {value});
        const auto wide = static_cast<__int128>(value);
        const bool fitsLong = wide <= std::numeric_limits<long>::max();
        EXPECT_EQ(fileio_tests::print("%d", argument).text,
                  fitsLong ? std::to_string(value) : formatted("%e", static_cast<double>(value)));
        EXPECT_EQ(fileio_tests::print("%u", argument).text,
                  value >= 0 ? std::to_string(value) : formatted("%e", static_cast<double>(value)));
    };
    const auto checkClass = [&check]<class T>(T, vxClassID classID) {
        check(std::numeric_limits<T>::min(), classID);
        check(std::numeric_limits<T>::max(), classID);
        check(static_cast<T>(5), classID);
    };
    checkClass(std::int8_t(), vxINT8_CLASS);
    checkClass(std::int16_t(), vxINT16_CLASS);
    checkClass(std::int32_t(), vxINT32_CLASS);
    checkClass(std::int64_t(), vxINT64_CLASS);
    checkClass(std::uint8_t(), vxUINT8_CLASS);
    checkClass(std::uint16_t(), vxUINT16_CLASS);
    checkClass(std::uint32_t(), vxUINT32_CLASS);
    checkClass(std::uint64_t(), vxUINT64_CLASS);
}

// With "#0" and a width, the digits of a bit pattern fill the width behind the prefix's own room.
TEST(PrintfOracle, BitPatternsOfEveryFlag) {
    const struct {
        int line;
        const char* format;
        double value;
        const char* text;
    } rows[] = {
        {__LINE__, "%tx", 1, "3f800000"},
        {__LINE__, "%bX", -1.5, "BFF8000000000000"},
        {__LINE__, "%bo", 1, "0377600000000000000000"},
        {__LINE__, "%bu", 1, "04607182418800017408"},
        {__LINE__, "%to", 1, "07740000000"},
        {__LINE__, "%bx", std::numeric_limits<double>::infinity(), "7ff0000000000000"},
        {__LINE__, "%tx", 0.1, "3dcccccd"},
        {__LINE__, "%012tx", 1, "00003f800000"},
        {__LINE__, "%-012tx|", 1, "3f800000    |"},
        {__LINE__, "%012.9tx", 1, "   03f800000"},
        {__LINE__, "%#tx", 1, "0x3f800000"},
        {__LINE__, "%#tX", 1, "0X3F800000"},
        {__LINE__, "%#020bx", 1, "0x00003ff0000000000000"},
        {__LINE__, "%#to", 1, "007740000000"},
        {__LINE__, "%#.12to", 1, "007740000000"},
        {__LINE__, "%#tu", 1, "1065353216"},
    };
    for (const auto& row : rows) {
        EXPECT_EQ(fileio_tests::print(row.format, makeScalar(row.value)).text, row.text)
            << "row of line " << row.line;
    }
}

TEST(PrintfOracle, PrecisionsBeyondTheDigitsOfADouble) {
    for (unsigned set = 0; set < 32; ++set) {
        std::string flags = "%";
        for (unsigned i = 0; i < 5; ++i) {
            if (set >> i & 1) flags += "-+ #0"[i];
        }
        for (const std::string field : {".1150", "1300.1101"}) {
            for (const char conversion : {'e', 'E', 'f', 'g', 'G'}) {
                for (const double value : {0.0, -0.1, 1e300, 5e-324, -2.5e17}) {
                    const std::string format = flags + field + conversion;
                    EXPECT_EQ(fileio_tests::print(format, makeScalar(value)).text,
                              formatted(format, value));
                }
            }
        }
    }
}

}  // namespace
