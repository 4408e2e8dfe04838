#include "fileio/attributes/precision_string.h"

#include "embedded/services/messages.h"
#include "tests/support/raised.h"

#include <sstream>
#include <string>
#include <vector>

#include <gtest/gtest.h>

namespace {

using Orvandeil::FileIO::PrecisionString;
using Orvandeil::FileIO::embedded::WarningRecorder;

// "input>output xrepeat bbits ssize @format", with parts at their defaults left out.
std::string describe(const PrecisionString& p) {
    const std::string raised = fileio_tests::raisedBy([&] { p.Validate(); });
    if (!raised.empty()) return raised.substr(raised.rfind(':') + 1);
    std::string text = std::to_string(p.inputType) + '>' + std::to_string(p.outputType);
    if (p.repeatCount != 1) text += " x" + std::to_string(p.repeatCount);
    if (p.bitCount != 0) text += " b" + std::to_string(p.bitCount);
    if (p.convertedSize != 0) text += " s" + std::to_string(p.convertedSize);
    if (p.machineFormat != 0) text += " @" + std::to_string(p.machineFormat);
    return text;
}

// Rows "text: description" between bars, each assigned to a copy of `start`. None of them warns.
void check(const char* table, const PrecisionString& start) {
    const WarningRecorder recorder;
    std::istringstream rows(table);
    for (std::string row; std::getline(rows, row, '|');) {
        PrecisionString precision(start);
        precision = row.substr(0, row.find(": ")).c_str();
        EXPECT_EQ(precision.text + ": " + describe(precision), row);
    }
    EXPECT_TRUE(recorder.warnings().empty());
}

TEST(PrecisionString, ReadsForReading) {
    check(
        "*bool: 1>1|*logical: 1>1|*char: 2>2|*char*1: 2>2|*schar: 3>3|*signed char: 3>3|*int8: 3>3|"
        "*integer*1: 3>3|*short: 4>4|*int16: 4>4|*integer*2: 4>4|*int: 5>5|*long: 5>5|*int32: 5>5|"
        "*integer*4: 5>5|*integer*8: 6>6|*uchar: 7>7|*unsigned char: 7>7|*uint8: 7>7|*ushort: 8>8|"
        "*unsigned short: 8>8|*uint16: 8>8|*uint: 9>9|*unsigned int: 9>9|*ulong: 9>9|*uint32: 9>9|"
        "*unsigned long: 9>9|*float: 11>11|*single: 11>11|*float32: 11>11|*real*4: 11>11|"
        "*double: 12>12|*float64: 12>12|*real*8: 12>12|int64: 6>12 s8 @5|uint64: 10>12 s8 @5|"
        "uchar: 7>12|* \tint16: 4>4|40*uchar=>char: 7>2 x40|007* double=>single: 12>11 x7|"
        "2147483647*int8: 3>12 x2147483647|int8=> char: 3>2|int16=>noconvert: 4>13|"
        "uint8=>int64: 7>6 @5",
        PrecisionString());
    // A target that is none leaves the output type alone; a field has to have the width of a type.
    check(
        "uchar=>nonsense: 7>12|uchar=>: 7>12|uchar=>char : 7>12|uchar=>int8=>int16: 7>12|"
        "uchar=>bit0: 7>12|uchar=>ubit8: 7>7|uchar=>bit16: 7>4|uchar=>ubit32: 7>9|"
        "uchar=>bit64: 7>6 @5",
        PrecisionString());
}

TEST(PrecisionString, RefusesForReading) {
    std::istringstream refused(
        "| uchar|uchar |Uchar|signed  char|char*2|int32*2|noconvert|*noconvert|"
        "*|3*|**uchar|*3*uchar|3**uchar|3uchar|3 *uchar| 3*uchar|+3*uchar|-1*uchar|0*uchar|"
        "2147483648*int8|99999999999999999999*int8|"
        "int8 =>char|int8= >char|int8=|int8=char|*int8=>int|"
        "uchar=>bit3|uchar=>bit40|uchar=>bit8in8|uchar=>bit16in16|"
        "bit|bit 8|bit +8|bit-8|bit8 |bits8|bit18446744073709551617|"
        "bit8in|bit8in 16|bit8in-16|bit8in16x|bit8 in16|int8in|bit1in18446744073709551617");
    for (std::string text; std::getline(refused, text, '|');)
        check((text + ": badprecision_vx").c_str(), PrecisionString());
}

TEST(PrecisionString, ReadsForWriting) {
    constexpr int single = 11;
    check(
        "double: 11>12|*int16: 11>4|5*ubit12: 11>8 x5 b12|bit3in8: 11>3 b3 s8|noconvert: 11>13|"
        "int8=>int8: badprecision_vx|int8=: badprecision_vx",
        PrecisionString(single));
    // The class of the values has no type in files.
    check("uint8: 0>7|noconvert: badprecision_vx", PrecisionString(0));
}

TEST(PrecisionString, SizesElementsOfForeignFormats) {
    PrecisionString precision;
    precision.machineFormat = 1;  // big endian
    check(
        "int16: 4>12 s2 @1|int64: 6>12 s8 @6|integer*8: 6>12 s8 @1|uint8=>int64: 7>6 s1 @6|"
        "int8=>noconvert: 3>13 s1 @1|ubit12: 8>12 b12 @1|bit33: 6>12 b33 @6|uint8=>uint32: 7>9 s1 "
        "@1|"
        "bit20in40: 6>12 b20 s40 @1|bit33in40: 6>12 b33 s40 @6",
        precision);
    precision.machineFormat = 6;  // with 64-bit longs
    check("uint64: 10>12 s8 @6|bit64: 6>12 b64 @6", precision);
}

// Every field without a container (room -1) and in containers of every size. Plain fields spelled
// like integers warn, or are the integers themselves.
TEST(PrecisionString, TakesEveryField) {
    const std::string warnings[] = {"KESTRA:FileIO:InvalidIntPrecision",
                                    "KESTRA:FileIO:InvalidUIntPrecision"};
    for (const std::string prefix : {"bit", "int", "ubit", "uint"}) {
        for (int trial = 0; trial < 67 * 68; ++trial) {
            const int bits = trial / 68, room = trial % 68 - 1, size = room < 0 ? bits : room;
            const bool isUnsigned = prefix[0] == 'u', isInteger = prefix.ends_with("int");
            if (isInteger && room < 0 && (bits == 8 || bits == 16 || bits == 32 || bits == 64))
                continue;
            std::string text = prefix + std::to_string(bits);
            if (room >= 0) text += "in" + std::to_string(room);
            const int container = (isUnsigned ? 7 : 3) + (size > 8) + (size > 16) + (size > 32);
            std::string expected = std::to_string(container) + ">12 b" + std::to_string(bits);
            if (room >= 0) expected += " s" + std::to_string(room);
            if (bits > 32) expected += " @5";
            const bool isField = bits >= 1 && bits <= size && size <= 64;
            const WarningRecorder recorder;
            ASSERT_EQ(describe(PrecisionString(text.c_str())),
                      isField ? expected : "badprecision_vx")
                << text;
            const std::size_t count = isField && isInteger && room < 0;
            ASSERT_EQ(recorder.identifiers(), std::vector(count, warnings[isUnsigned])) << text;
        }
    }
}

TEST(PrecisionString, CopiesAndAssignsDifferently) {
    const PrecisionString source("3*bit33"), copy = source;
    EXPECT_EQ(copy.text + ' ' + describe(copy), "3*bit33 6>12 x3 b33 @5");
    PrecisionString invalid("nonsense");
    invalid = source;
    EXPECT_EQ(invalid.text + ' ' + describe(invalid), "nonsense badprecision_vx");
    invalid.valid = true;
    EXPECT_EQ(describe(invalid), "6>12 x3 b33 @5");
    EXPECT_EQ(PrecisionString().text + ' ' + describe(PrecisionString()), "uchar 7>12");
    EXPECT_EQ(describe(PrecisionString(5)), "5>7");
}

}  // namespace
