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
const char* const badSize = "KESTRA:legacy_two_part:badsize_vx";
const char* const badSkip = "KESTRA:legacy_two_part:badskip_vx";
const char* const notNumeric = "KESTRA:FileIO:sizeMustBeNumeric";

std::string raisedBy(const NumericAttr& attribute) {
    return fileio_tests::raisedBy([&] { attribute.Validate(); });
}

TEST(SizeAttribute, ParsesNumbersAndPairs) {
    const struct {
        int line;
        std::vector<double> values;  // one row
        bool valid;
        unsigned long m, n;
        bool isInfinite;
    } rows[] = {
        {__LINE__, {2.9}, true, 2, 1, false},
        {__LINE__, {0}, true, 0, 0, false},
        {__LINE__, {0.5}, true, 0, 1, false},
        {__LINE__, {limit}, true, 281474976710655, 1, false},
        {__LINE__, {limit + 1}, true, 1, 0, true},
        {__LINE__, {1e300}, true, 1, 0, true},
        {__LINE__, {-1}, false, 1, 0, false},
        {__LINE__, {-0.5}, false, 1, 0, false},
        {__LINE__, {NAN}, false, 1, 0, false},
        {__LINE__, {}, false, 1, 0, false},
        {__LINE__, {3, 4.9}, true, 3, 4, false},
        {__LINE__, {3, inf}, true, 3, 0, true},
        {__LINE__, {0, inf}, true, 0, 0, false},
        {__LINE__, {0.5, inf}, true, 0, 0, true},
        {__LINE__, {16777216, 16777215}, true, 16777216, 16777215, false},
        {__LINE__, {16777216, 16777216}, false, 1, 0, false},
        {__LINE__, {inf, 3}, false, 1, 0, false},
        {__LINE__, {limit + 1, 0}, false, 1, 0, false},
        {__LINE__, {0, NAN}, false, 1, 0, false},
        {__LINE__, {NAN, 1}, false, 1, 0, false},
        {__LINE__, {1, -0.1}, false, 1, 0, false},
        {__LINE__, {1, 2, 3}, false, 1, 0, false},
    };
    for (const auto& row : rows) {
        const SizeAttribute size(makeDoubles(1, row.values.size(), row.values).get());
        EXPECT_EQ(size.IsValid(), row.valid) << row.line;
        EXPECT_EQ(raisedBy(size), row.valid ? "" : badSize) << row.line;
        EXPECT_EQ(size.m, row.m) << row.line;
        EXPECT_EQ(size.n, row.n) << row.line;
        EXPECT_EQ(size.isInfinite, row.isInfinite) << row.line;
        EXPECT_EQ(size.isMatrix, row.valid && row.values.size() == 2) << row.line;
    }
}

TEST(SizeAttribute, LooksAtTheTypeBeforeTheShape) {
    const struct {
        int line;
        ArrayPtr array;
        const char* raised;
    } rows[] = {
        {__LINE__, embedded::makeChars(u"7"), notNumeric},
        {__LINE__, embedded::makeChars(u""), notNumeric},
        {__LINE__, embedded::makeNumeric(vxLOGICAL_CLASS, {1, 1}), notNumeric},
        {__LINE__, embedded::makeNumeric(vxDOUBLE_CLASS, {1, 1}, vxCOMPLEX), notNumeric},
        {__LINE__, embedded::makeString(u"7"), notNumeric},
        {__LINE__, embedded::makeNumeric(vxDOUBLE_CLASS, {1, 1, 2}), badSize},
        {__LINE__, embedded::makeNumeric(vxINT8_CLASS, {2, 1}), badSize},
        {__LINE__, makeRow<std::int8_t>(vxINT8_CLASS, {-1}), badSize},
        {__LINE__, makeRow<std::uint64_t>(vxUINT64_CLASS, {7, 8}), ""},
        {__LINE__, makeRow<float>(vxSINGLE_CLASS, {7, HUGE_VALF}), ""},
    };
    for (const auto& row : rows)
        EXPECT_EQ(raisedBy(SizeAttribute(row.array.get())), row.raised) << row.line;
}

TEST(SizeAttribute, StartsAfreshEachTime) {
    SizeAttribute size;
    EXPECT_TRUE(size.IsValid() && size.isInfinite && !size.isMatrix);
    size = embedded::makeChars(u"7").get();
    const SizeAttribute copy = size;
    EXPECT_EQ(raisedBy(size), notNumeric);
    EXPECT_EQ(raisedBy(size), notNumeric);
    size = makeDoubles(1, 2, {3, inf}).get();
    EXPECT_EQ(raisedBy(size), "");
    size = makeDoubles(1, 1, {NAN}).get();
    EXPECT_EQ(raisedBy(size), badSize);
    EXPECT_EQ(size.m, 1u);
    EXPECT_FALSE(size.isMatrix);
    EXPECT_EQ(raisedBy(copy), notNumeric);

    int form = 9;
    EXPECT_EQ(size.ParseSize(makeDoubles(1, 2, {5, 6}).get(), &form), 0);
    EXPECT_EQ(form, 2);
    EXPECT_EQ(size.ParseSize(makeDoubles(1, 1, {-6}).get(), &form), 1);
    EXPECT_EQ(form, 1);
    EXPECT_EQ(size.m, 5u);
}

TEST(SizeAttribute, AdjustsToBytesInOneRow) {
    const struct {
        int line;
        int kind;
        unsigned long m, n;
        bool isInfinite;
        unsigned long elementSize, newM, newN;
        bool raises;
    } rows[] = {
        {__LINE__, 13, 3, 5, false, 4, 1, 4, false},
        {__LINE__, 12, 3, 5, false, 4, 3, 5, false},
        {__LINE__, 13, 3, 5, true, 0, 1, 5, false},
        {__LINE__, 13, 0, 5, false, 8, 1, 0, false},
        {__LINE__, 13, 0, 5, false, 0, 0, 5, true},
        {__LINE__, 13, 3, 5, false, 0, 3, 5, true},
        {__LINE__, 13, 1ul << 32, 1ul << 31, false, 1, 1, 1ul << 63, false},
        {__LINE__, 13, 1ul << 32, 1ul << 32, false, 1, 1ul << 32, 1ul << 32, true},
    };
    for (const auto& row : rows) {
        SizeAttribute size;
        size.m = row.m;
        size.n = row.n;
        size.isInfinite = row.isInfinite;
        EXPECT_EQ(fileio_tests::raisedBy([&] { size.Adjust(row.kind, row.elementSize); }),
                  row.raises ? "KESTRA:legacy_two_part:p64bitsize" : "")
            << row.line;
        EXPECT_EQ(size.m, row.newM) << row.line;
        EXPECT_EQ(size.n, row.newN) << row.line;
    }
}

TEST(SkipAttribute, TakesTheFirstElement) {
    const struct {
        int line;
        ArrayPtr array;
        bool valid;
        long skip;
    } rows[] = {
        {__LINE__, embedded::makeScalar(3), true, 3},
        {__LINE__, makeDoubles(2, 1, {2, 9}), true, 2},
        {__LINE__, makeRow<std::int8_t>(vxINT8_CLASS, {5}), true, 5},
        {__LINE__, makeRow<std::uint64_t>(vxUINT64_CLASS, {LONG_MAX}), true, LONG_MAX},
        {__LINE__, makeRow<std::uint64_t>(vxUINT64_CLASS, {1ul << 63}), false, LONG_MAX},
        {__LINE__, embedded::makeScalar(3.5), false, 3},
        {__LINE__, embedded::makeScalar(-1), false, -1},
        {__LINE__, embedded::makeScalar(NAN), false, 0},
        {__LINE__, embedded::makeScalar(inf), false, 1},
        {__LINE__, makeDoubles(0, 0, {}), false, 0},
        {__LINE__, embedded::makeChars(u"3"), false, 0},
        {__LINE__, embedded::makeNumeric(vxLOGICAL_CLASS, {1, 1}), false, 0},
    };
    SkipAttribute reused;
    for (const auto& row : rows) {
        reused = row.array.get();
        EXPECT_EQ(raisedBy(reused), row.valid ? "" : badSkip) << row.line;
        EXPECT_EQ(reused.skip, row.skip) << row.line;
    }
}

TEST(NumericAttr, ReadsWholeNumbersOf64Bits) {
    const struct {
        int line;
        double d;
        bool whole;
        long out;
    } rows[] = {
        {__LINE__, 0, true, 0},
        {__LINE__, -2.5, false, -2},
        {__LINE__, 0x1p62, true, 1l << 62},
        {__LINE__, 0x1p63, false, 0},
        {__LINE__, 0x1p63 - 1024, true, LONG_MAX - 1023},
        {__LINE__, -0x1p63, true, LONG_MIN},
        {__LINE__, -0x1p63 - 2048, false, 0},
        {__LINE__, inf, false, 1},
        {__LINE__, -inf, false, -1},
        {__LINE__, NAN, false, 0},
    };
    for (const auto& row : rows) {
        long out = 77;
        bool isNaN = !std::isnan(row.d);
        bool isInf = !std::isinf(row.d);
        EXPECT_EQ(NumericAttr::GetInt64(row.d, out, &isNaN, &isInf), row.whole) << row.line;
        EXPECT_EQ(out, row.out) << row.line;
        EXPECT_EQ(isNaN, std::isnan(row.d)) << row.line;
        EXPECT_EQ(isInf, std::isinf(row.d)) << row.line;
    }
}

TEST(NumericAttr, ReplacesWhatIsNo32BitNumber) {
    const struct {
        double d;
        int result;
    } rows[] = {{3e9, 7},   {-3e9, INT_MIN}, {NAN, 7},        {2147483647, INT_MAX},
                {-2.9, -2}, {inf, 7},        {-inf, INT_MIN}, {2147483647.5, 7},
                {2.9, 2}};
    for (const auto& row : rows)
        EXPECT_EQ(NumericAttr::ReplaceOutOfRange(row.d, 7), row.result) << row.d;
}

}  // namespace
