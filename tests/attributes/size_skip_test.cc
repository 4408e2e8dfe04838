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
constexpr double limit = 281474976710655;

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

std::string sizeOf(const std::vector<double>& values) {
    return summary(SizeAttribute(makeDoubles(1, values.size(), values).get()));
}

TEST(SizeAttribute, ParsesNumbersAndPairs) {
    EXPECT_EQ(sizeOf({2.9}), "2 1 ");
    EXPECT_EQ(sizeOf({0}), "0 0 ");
    EXPECT_EQ(sizeOf({0.5}), "0 1 ");
    EXPECT_EQ(sizeOf({limit}), "281474976710655 1 ");
    EXPECT_EQ(sizeOf({limit + 1}), "1 0 infinite ");
    EXPECT_EQ(sizeOf({3, 4.9}), "3 4 matrix ");
    EXPECT_EQ(sizeOf({3, inf}), "3 0 matrix infinite ");
    EXPECT_EQ(sizeOf({0, inf}), "0 0 matrix ");
    EXPECT_EQ(sizeOf({0.5, inf}), "0 0 matrix infinite ");
    EXPECT_EQ(sizeOf({16777216, 16777215}), "16777216 16777215 matrix ");
    for (const std::vector<double>& values : std::vector<std::vector<double>>{{-0.5},
                                                                              {NAN},
                                                                              {},
                                                                              {16777216, 16777216},
                                                                              {limit + 1, 0},
                                                                              {0, NAN},
                                                                              {NAN, 1},
                                                                              {1, -0.1},
                                                                              {1, 2, 3}})
        EXPECT_EQ(sizeOf(values), "1 0 badsize_vx") << testing::PrintToString(values);
}

TEST(SizeAttribute, LooksAtTheTypeBeforeTheShape) {
    const auto error = [](const ArrayPtr& array) { return errorOf(SizeAttribute(array.get())); };
    EXPECT_EQ(error(embedded::makeChars(u"")), "sizeMustBeNumeric");
    EXPECT_EQ(error(embedded::makeNumeric(vxLOGICAL_CLASS, {1, 1})), "sizeMustBeNumeric");
    EXPECT_EQ(error(embedded::makeNumeric(vxDOUBLE_CLASS, {1, 1}, vxCOMPLEX)), "sizeMustBeNumeric");
    EXPECT_EQ(error(embedded::makeString(u"7")), "sizeMustBeNumeric");
    EXPECT_EQ(error(embedded::makeNumeric(vxDOUBLE_CLASS, {1, 1, 2})), "badsize_vx");
    EXPECT_EQ(error(embedded::makeNumeric(vxINT8_CLASS, {2, 1})), "badsize_vx");
    EXPECT_EQ(error(makeRow<std::int8_t>(vxINT8_CLASS, {-1})), "badsize_vx");
    EXPECT_EQ(error(makeRow<std::uint64_t>(vxUINT64_CLASS, {7, 8})), "");
}

TEST(SizeAttribute, StartsAfreshEachTime) {
    SizeAttribute size;
    EXPECT_EQ(summary(size), "1 0 infinite ");
    size = embedded::makeChars(u"7").get();
    const SizeAttribute copy = size;
    size = makeDoubles(1, 2, {3, inf}).get();
    EXPECT_EQ(summary(size), "3 0 matrix infinite ");
    size = makeDoubles(1, 1, {NAN}).get();
    EXPECT_EQ(summary(size), "1 0 badsize_vx");
    EXPECT_EQ(errorOf(copy), "sizeMustBeNumeric");

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

TEST(SkipAttribute, TakesTheFirstElement) {
    SkipAttribute reused;
    const auto skip = [&](const ArrayPtr& array) {
        reused = array.get();
        return std::to_string(reused.skip) + errorOf(reused);
    };
    const std::string bad = "badskip_vx";
    EXPECT_EQ(skip(makeDoubles(2, 1, {2, 9})), "2");
    EXPECT_EQ(skip(makeDoubles(1, 1, {3.5})), "3" + bad);
    EXPECT_EQ(skip(makeRow<std::int8_t>(vxINT8_CLASS, {5})), "5");
    EXPECT_EQ(skip(makeRow<std::uint64_t>(vxUINT64_CLASS, {LONG_MAX})), std::to_string(LONG_MAX));
    EXPECT_EQ(skip(makeRow<std::uint64_t>(vxUINT64_CLASS, {1ul << 63})),
              std::to_string(LONG_MAX) + bad);
    EXPECT_EQ(skip(embedded::makeScalar(-1)), "-1" + bad);
    EXPECT_EQ(skip(embedded::makeScalar(inf)), "1" + bad);
    EXPECT_EQ(skip(makeDoubles(0, 0, {})), "0" + bad);
    EXPECT_EQ(skip(embedded::makeChars(u"3")), "0" + bad);
    EXPECT_EQ(skip(embedded::makeNumeric(vxLOGICAL_CLASS, {1, 1})), "0" + bad);
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
