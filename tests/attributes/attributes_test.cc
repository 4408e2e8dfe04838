#include "embedded/services/array.h"
#include "embedded/services/messages.h"
#include "fileio/attributes/machine_format.h"
#include "fileio/attributes/precision_string.h"
#include "fileio/attributes/size_attribute.h"
#include "fileio/attributes/skip_attribute.h"
#include "fileio/host/data_sizes.h"
#include "tests/support/raised.h"

#include <climits>
#include <cmath>
#include <cstdint>
#include <sstream>
#include <string>
#include <vector>

#include <gtest/gtest.h>

namespace {

using Orvandeil::FileIO::MachineFormat;
using Orvandeil::FileIO::PrecisionString;
using Orvandeil::FileIO::embedded::WarningRecorder;
using namespace Orvandeil::FileIO;
using embedded::ArrayPtr;
using embedded::makeDoubles;
using embedded::makeRow;

TEST(MachineFormat, ValidatesByLegacyNumber) {
    MachineFormat assigned("big-endian");
    assigned = " ";
    EXPECT_EQ(assigned.dataSizeType, 1) << "refused, and nothing changes";
    EXPECT_EQ(assigned.text, "");
    EXPECT_FALSE(assigned.valid);
    assigned = "\xCC";
    EXPECT_EQ(assigned.dataSizeType, vxDataSizeCount() - 1);
    assigned = vxDataSizeName(6);
    EXPECT_TRUE(assigned.valid);
    const MachineFormat native, invalid("no such format"), copy = invalid;
    EXPECT_EQ(native.dataSizeType, vxDataSizeNative());
    EXPECT_EQ(native.errorMessageNumber, 34);
    EXPECT_EQ(copy.dataSizeType, vxDataSizeCount() - 1);
    EXPECT_EQ(fileio_tests::raisedBy([&] { native.Validate(); }), "");
    EXPECT_EQ(fileio_tests::raisedBy([&] { copy.Validate(); }),
              "KESTRA:legacy_two_part:badmachformat_vx");
}

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

constexpr double inf = HUGE_VAL;

// The last part of what an attribute raises.
std::string errorOf(const NumericAttr& attribute) {
    const std::string raised = fileio_tests::raisedBy([&] { attribute.Validate(); });
    EXPECT_EQ(fileio_tests::raisedBy([&] { attribute.Validate(); }), raised) << "the second time";
    EXPECT_EQ(attribute.IsValid(), raised.empty());
    return raised.substr(raised.rfind(':') + 1);
}

// "m n", what it is besides, the error.
std::string summary(const SizeAttribute& size) {
    return std::to_string(size.m) + ' ' + std::to_string(size.n) +
           (size.isMatrix ? " matrix" : "") + (size.isInfinite ? " infinite" : "") + ' ' +
           errorOf(size);
}

TEST(NumericAttr, StartsAfreshEachTime) {
    SizeAttribute size;
    EXPECT_EQ(summary(size), "1 0 infinite ");
    size = embedded::makeChars(u"7").get();
    const SizeAttribute copy = size;
    size = makeDoubles(1, 2, {3, inf}).get();
    EXPECT_EQ(summary(size), "3 0 matrix infinite ");
    size = makeDoubles(1, 1, {NAN}).get();
    EXPECT_EQ(summary(size), "1 0 badsize_vx");
    EXPECT_EQ(errorOf(copy), "sizeMustBeNumeric");

    size = embedded::makeNumeric(vxDOUBLE_CLASS, {1, 1, 2}).get();
    EXPECT_EQ(errorOf(size), "badsize_vx");
    SkipAttribute skip;
    skip = makeDoubles(1, 1, {2.5}).get();
    EXPECT_EQ(errorOf(skip), "badskip_vx");
    skip = makeDoubles(1, 1, {3}).get();
    EXPECT_EQ(errorOf(skip), "");
    EXPECT_EQ(skip.skip, 3);

    int form = 9;
    EXPECT_EQ(size.ParseSize(makeDoubles(1, 2, {5, 6}).get(), &form), 0);
    EXPECT_EQ(form, 2);
    EXPECT_EQ(size.ParseSize(makeDoubles(1, 1, {-6}).get(), &form), 1);
    EXPECT_EQ(form, 1);
    EXPECT_EQ(size.m, 5u);
}

TEST(SizeAttribute, AdjustsToBytesInOneRow) {
    using Count = unsigned long;
    const auto adjusted = [](int kind, Count m, Count n, bool isInfinite, Count elementSize) {
        SizeAttribute size;
        size.m = m;
        size.n = n;
        size.isInfinite = isInfinite;
        const auto raised = fileio_tests::raisedBy([&] { size.Adjust(kind, elementSize); });
        return std::to_string(size.m) + ' ' + std::to_string(size.n) + raised;
    };
    const std::string tooBig = "KESTRA:legacy_two_part:p64bitsize";
    EXPECT_EQ(adjusted(13, 3, 5, false, 4), "1 4");
    EXPECT_EQ(adjusted(12, 3, 5, false, 4), "3 5");
    EXPECT_EQ(adjusted(13, 3, 5, true, 0), "1 5");
    EXPECT_EQ(adjusted(13, 0, 5, false, 8), "1 0");
    EXPECT_EQ(adjusted(13, 0, 5, false, 0), "0 5" + tooBig);
    EXPECT_EQ(adjusted(13, 3, 5, false, 0), "3 5" + tooBig);
    EXPECT_EQ(adjusted(13, 1ul << 32, 1ul << 31, false, 1), "1 9223372036854775808");
}

TEST(NumericAttr, ReadsWholeNumbersOf64Bits) {
    const auto whole = [](double d) {
        long out = 77;
        bool isNaN = !std::isnan(d), isInf = !std::isinf(d);
        const bool isWhole = NumericAttr::GetInt64(d, out, &isNaN, &isInf);
        EXPECT_TRUE(isNaN == std::isnan(d) && isInf == std::isinf(d)) << d;
        return std::to_string(out) + (isWhole ? "" : " no");
    };
    EXPECT_EQ(whole(0), "0");
    EXPECT_EQ(whole(-2.5), "-2 no");
    EXPECT_EQ(whole(0x1p63), "0 no");
    EXPECT_EQ(whole(0x1p63 - 1024), std::to_string(LONG_MAX - 1023));
    EXPECT_EQ(whole(-0x1p63), std::to_string(LONG_MIN));
    EXPECT_EQ(whole(-0x1p63 - 2048), "0 no");
    EXPECT_EQ(whole(inf), "1 no");
    EXPECT_EQ(whole(-inf), "-1 no");
    EXPECT_EQ(whole(NAN), "0 no");
    const std::pair<double, int> rows[] = {
        {3e9, 7},   {-3e9, INT_MIN}, {NAN, 7},         {0x1p31 - 1, INT_MAX},
        {-2.9, -2}, {-inf, INT_MIN}, {0x1p31 - 0.5, 7}};
    for (const auto& [d, result] : rows)
        EXPECT_EQ(NumericAttr::ReplaceOutOfRange(d, 7), result) << d;
}

}  // namespace
