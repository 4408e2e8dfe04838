#include "embedded/services/array.h"
#include "fileio/attributes/size_attribute.h"
#include "fileio/attributes/skip_attribute.h"
#include "tests/support/raised.h"

#include <climits>
#include <cmath>
#include <cstdint>

#include <gtest/gtest.h>

namespace {

using namespace Orvandeil::FileIO;
using embedded::ArrayPtr;
using embedded::makeDoubles;
using embedded::makeRow;

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
