#include "fileio/attributes/precision_string.h"

#include "embedded/services/messages.h"
#include "fileio/host/exception.h"

#include <sstream>
#include <string>
#include <vector>

#include <gtest/gtest.h>

namespace {

using Orvandeil::FileIO::PrecisionString;
using Orvandeil::FileIO::embedded::WarningRecorder;

constexpr int bigEndian = 1;
constexpr int bigEndianLong64 = 6;

// "input>output xrepeat bits/size @format", with parts at their defaults left out.
std::string describe(const PrecisionString& p) {
    std::string text = std::to_string(p.inputType) + '>' + std::to_string(p.outputType);
    if (p.repeatCount != 1) text += " x" + std::to_string(p.repeatCount);
    if (p.bitCount != 0) text += " b" + std::to_string(p.bitCount);
    if (p.convertedSize != 0) text += " s" + std::to_string(p.convertedSize);
    if (p.machineFormat != 0) text += " @" + std::to_string(p.machineFormat);
    return text;
}

struct Row {
    int line;
    const char* text;
    const char* expected;
};

void check(const Row& row, PrecisionString precision) {
    precision = row.text;
    EXPECT_EQ(precision.text, row.text) << row.line;
    EXPECT_TRUE(precision.valid) << row.line;
    EXPECT_EQ(describe(precision), row.expected) << row.line;
}

TEST(PrecisionString, KnowsTheNames) {
    std::istringstream names(
        "bool 1|logical 1|char 2|char*1 2|schar 3|signed char 3|int8 3|integer*1 3|short 4|"
        "int16 4|integer*2 4|int 5|long 5|int32 5|integer*4 5|int64 6|integer*8 6|uchar 7|"
        "unsigned char 7|uint8 7|ushort 8|unsigned short 8|uint16 8|uint 9|unsigned int 9|ulong 9|"
        "unsigned long 9|uint32 9|uint64 10|float 11|single 11|float32 11|real*4 11|double 12|"
        "float64 12|real*8 12|");
    const WarningRecorder recorder;
    for (std::string row; std::getline(names, row, '|');) {
        const std::size_t blank = row.rfind(' ');
        const PrecisionString precision(('*' + row.substr(0, blank)).c_str());
        EXPECT_TRUE(precision.valid) << row;
        EXPECT_EQ(std::to_string(precision.outputType), row.substr(blank + 1)) << row;
        EXPECT_EQ(precision.bitCount, 0) << row;
    }
    EXPECT_TRUE(recorder.warnings().empty());
}

TEST(PrecisionString, ReadsForReading) {
    const Row rows[] = {
        {__LINE__, "uchar", "7>12"},
        {__LINE__, "*uchar", "7>7"},
        {__LINE__, "* \tint16", "4>4"},
        {__LINE__, "40*uchar=>char", "7>2 x40"},
        {__LINE__, "007* double=>single", "12>11 x7"},
        {__LINE__, "2147483647*int8", "3>12 x2147483647"},
        {__LINE__, "integer*8", "6>12"},
        {__LINE__, "int64", "6>12 s8 @5"},
        {__LINE__, "int8=> char", "3>2"},
        {__LINE__, "int16=>noconvert", "4>13"},
        {__LINE__, "uint8=>int64", "7>6 @5"},  // the format moves with the target too
        // A target that is none leaves the output type alone.
        {__LINE__, "uchar=>nonsense", "7>12"},
        {__LINE__, "uchar=>", "7>12"},
        {__LINE__, "uchar=>char ", "7>12"},
        {__LINE__, "uchar=>int8=>int16", "7>12"},
        {__LINE__, "uchar=>bit0", "7>12"},
        // Fields as targets have to have the width of a type.
        {__LINE__, "uchar=>ubit8", "7>7"},
        {__LINE__, "uchar=>bit16", "7>4"},
        {__LINE__, "uchar=>ubit32", "7>9"},
        {__LINE__, "uchar=>bit64", "7>6 @5"},
    };
    for (const Row& row : rows)
        check(row, PrecisionString());
}

TEST(PrecisionString, RefusesForReading) {
    std::istringstream refused(
        "| uchar|uchar |Uchar|signed  char|char*2|int32*2|noconvert|*noconvert|"
        "*|3*|**uchar|*3*uchar|3**uchar|3uchar|3 *uchar| 3*uchar|+3*uchar|-1*uchar|0*uchar|"
        "2147483648*int8|99999999999999999999*int8|"
        "int8 =>char|int8= >char|int8=|int8=char|*int8=>int|"
        "uchar=>bit3|uchar=>bit40|uchar=>bit8in8|uchar=>bit16in16|"
        "bit|bit 8|bit +8|bit-8|bit8 |bits8|bit18446744073709551617|"
        "bit8in|bit8in 16|bit8in-16|bit8in16x|bit8 in16|int8in|bit1in18446744073709551617|");
    const WarningRecorder recorder;
    for (std::string text; std::getline(refused, text, '|');) {
        try {
            PrecisionString(text.c_str()).Validate();
            ADD_FAILURE() << text;
        } catch (const foundation::core::except::IMsgIDException& error) {
            EXPECT_EQ(error.GetID(), "KESTRA:legacy_two_part:badprecision_vx") << text;
        }
    }
    EXPECT_TRUE(recorder.warnings().empty());
}

TEST(PrecisionString, ReadsForWriting) {
    constexpr int single = 11;
    const Row rows[] = {
        {__LINE__, "double", "11>12"},         {__LINE__, "*int16", "11>4"},
        {__LINE__, "5*ubit12", "11>8 x5 b12"}, {__LINE__, "bit3in8", "11>3 b3 s8"},
        {__LINE__, "noconvert", "11>13"},
    };
    for (const Row& row : rows)
        check(row, PrecisionString(single));
    PrecisionString precision(single);
    EXPECT_FALSE(precision.Init("int8=>int8"));
    EXPECT_FALSE(precision.Init("int8="));
    PrecisionString object(0);  // the class of the values has no type in files
    EXPECT_TRUE(object.Init("uint8"));
    EXPECT_FALSE(object.Init("noconvert"));
}

TEST(PrecisionString, SizesElementsOfForeignFormats) {
    const Row rows[] = {
        {__LINE__, "int16", "4>12 s2 @1"},           {__LINE__, "int64", "6>12 s8 @6"},
        {__LINE__, "integer*8", "6>12 s8 @1"},       {__LINE__, "uint8=>int64", "7>6 s1 @6"},
        {__LINE__, "int8=>noconvert", "3>13 s1 @1"}, {__LINE__, "ubit12", "8>12 b12 @1"},
        {__LINE__, "bit33", "6>12 b33 @6"},          {__LINE__, "bit20in40", "6>12 b20 s40 @1"},
        {__LINE__, "bit33in40", "6>12 b33 s40 @6"},  {__LINE__, "uint8=>uint32", "7>9 s1 @1"},
    };
    PrecisionString precision;
    precision.machineFormat = bigEndian;
    for (const Row& row : rows)
        check(row, precision);
    precision.machineFormat = bigEndianLong64;
    check({__LINE__, "uint64", "10>12 s8 @6"}, precision);
    check({__LINE__, "bit64", "6>12 b64 @6"}, precision);
}

int containerFor(int bits, bool isSigned) {
    int code = isSigned ? 3 : 7;
    for (int room = 8; room < bits; room *= 2)
        ++code;
    return code;
}

// Fields of these widths, spelled like integers, are the integers themselves.
bool isName(const std::string& prefix, int bits) {
    return prefix.ends_with("int") && (bits == 8 || bits == 16 || bits == 32 || bits == 64);
}

TEST(PrecisionString, TakesEveryFieldWidth) {
    for (const std::string prefix : {"bit", "int", "ubit", "uint"}) {
        const bool isSigned = prefix[0] != 'u';
        for (int bits = 0; bits <= 70; ++bits) {
            const std::string text = prefix + std::to_string(bits);
            if (isName(prefix, bits)) continue;
            const WarningRecorder recorder;
            const PrecisionString precision(text.c_str());
            const bool expected = bits >= 1 && bits <= 64;
            EXPECT_EQ(precision.valid, expected) << text;
            std::vector<std::string> warnings;
            if (expected) {
                EXPECT_EQ(precision.inputType, containerFor(bits, isSigned)) << text;
                EXPECT_EQ(precision.bitCount, bits) << text;
                EXPECT_EQ(precision.machineFormat, bits > 32 ? 5 : 0) << text;
                if (prefix == "int") warnings = {"KESTRA:FileIO:InvalidIntPrecision"};
                if (prefix == "uint") warnings = {"KESTRA:FileIO:InvalidUIntPrecision"};
            }
            EXPECT_EQ(recorder.identifiers(), warnings) << text;
        }
    }
}

TEST(PrecisionString, TakesFieldsInContainers) {
    const WarningRecorder recorder;
    for (int bits = 0; bits <= 66; ++bits) {
        for (int room = 0; room <= 66; ++room) {
            const std::string text = "int" + std::to_string(bits) + "in" + std::to_string(room);
            const PrecisionString precision(text.c_str());
            const bool expected = bits >= 1 && bits <= room && room <= 64;
            ASSERT_EQ(precision.valid, expected) << text;
            if (!expected) continue;
            ASSERT_EQ(precision.inputType, containerFor(room, true)) << text;
            ASSERT_EQ(precision.bitCount, bits) << text;
            ASSERT_EQ(precision.convertedSize, room) << text;
        }
    }
    EXPECT_TRUE(recorder.warnings().empty()) << "only the plain form warns";
}

TEST(PrecisionString, CopiesAndAssignsDifferently) {
    const PrecisionString source("3*bit33");
    const PrecisionString copy = source;
    EXPECT_EQ(copy.text + ' ' + describe(copy), "3*bit33 6>12 x3 b33 @5");
    EXPECT_TRUE(copy.valid);

    PrecisionString invalid("nonsense");
    invalid = source;
    EXPECT_EQ(invalid.text + ' ' + describe(invalid), "nonsense 6>12 x3 b33 @5");
    EXPECT_FALSE(invalid.valid);

    EXPECT_EQ(PrecisionString().text + ' ' + describe(PrecisionString()), "uchar 7>12");
    EXPECT_EQ(describe(PrecisionString(5)), "5>7");
}

}  // namespace
