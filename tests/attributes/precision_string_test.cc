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

TEST(PrecisionString, ReadsForWriting) {
    constexpr int single = 11;
    check(
        "double: 11>12|*int16: 11>4|5*ubit12: 11>8 x5 b12|bit3in8: 11>3 b3 s8|noconvert: 11>13|"
        "int8=>int8: badprecision_vx|int8=: badprecision_vx",
        PrecisionString(single));
    // The class of the values has no type in files.
    check("uint8: 0>7|noconvert: badprecision_vx", PrecisionString(0));
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
