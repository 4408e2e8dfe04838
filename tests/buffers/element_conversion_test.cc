#include "fileio/buffers/element_conversion.h"

#include "embedded/services/array.h"
#include "fileio/buffers/convert_element.h"

#include <algorithm>
#include <bit>
#include <cmath>
#include <limits>
#include <vector>

#include <gtest/gtest.h>

namespace {

using namespace Orvandeil::FileIO;
using detail::Logical;

constexpr double inf = std::numeric_limits<double>::infinity();
constexpr double nan = std::numeric_limits<double>::quiet_NaN();

struct ElementClass {
    vxClassID classID;
    std::size_t bytes;
    long double lowest;
    long double highest;
    bool floating;
};

const ElementClass classes[] = {
    {vxLOGICAL_CLASS, 1, 0, 1, false},
    {vxCHAR_CLASS, 2, 0, 0xFFFF, false},
    {vxDOUBLE_CLASS, 8, -0x1.fffffffffffffp1023L, 0x1.fffffffffffffp1023L, true},
    {vxSINGLE_CLASS, 4, -0x1.fffffep127L, 0x1.fffffep127L, true},
    {vxINT8_CLASS, 1, -128, 127, false},
    {vxUINT8_CLASS, 1, 0, 255, false},
    {vxINT16_CLASS, 2, -32768, 32767, false},
    {vxUINT16_CLASS, 2, 0, 65535, false},
    {vxINT32_CLASS, 4, -0x1p31L, 0x1p31L - 1, false},
    {vxUINT32_CLASS, 4, 0, 0x1p32L - 1, false},
    {vxINT64_CLASS, 8, -0x1p63L, 0x1p63L - 1, false},
    {vxUINT64_CLASS, 8, 0, 0x1p64L - 1, false},
};

// Elements as the extended numbers of the C library, which hold each of every class exactly.
std::vector<long double> unpack(const ElementClass& c, const char* bytes, std::size_t count) {
    std::vector<long double> values;
    for (std::size_t i = 0; i < count; ++i) {
        switch (c.classID) {
#define UNPACK(id, Type)                                                                 \
    case id:                                                                             \
        values.push_back(static_cast<long double>(detail::loadElement<Type>(bytes, i))); \
        break;
            FILEIO_FOR_EACH_ELEMENT(UNPACK)
#undef UNPACK
            default:
                ADD_FAILURE();
        }
    }
    return values;
}

std::vector<char> pack(const ElementClass& c, const std::vector<long double>& values) {
    std::vector<char> bytes;
    for (const long double value : values) {
        switch (c.classID) {
#define PACK(id, Type)                                                                    \
    case id: {                                                                            \
        const auto element = static_cast<Type>(static_cast<detail::Number<Type>>(value)); \
        const auto* raw = reinterpret_cast<const char*>(&element);                        \
        bytes.insert(bytes.end(), raw, raw + sizeof element);                             \
        break;                                                                            \
    }
            FILEIO_FOR_EACH_ELEMENT(PACK)
#undef PACK
            default:
                ADD_FAILURE();
        }
    }
    return bytes;
}

// The oracle.
long double expectedElement(const ElementClass& to, long double value) {
    if (to.classID == vxDOUBLE_CLASS) return static_cast<double>(value);
    if (to.classID == vxSINGLE_CLASS) return static_cast<float>(value);
    if (std::isnan(value)) return 0;
    return std::clamp(std::round(value), to.lowest, to.highest);
}

// Converts with both blocks off any alignment, and compares every element.
void checkAgainstOracle(const ElementClass& to, const ElementClass& from,
                        const std::vector<long double>& values) {
    std::vector<char> source = pack(from, values);
    source.insert(source.begin(), 'x');
    std::vector<char> target(1 + values.size() * to.bytes + 1, 'x');
    void* end = AssignToVoidBuffer(to.classID, target.data() + 1, from.classID, source.data() + 1,
                                   values.size());
    ASSERT_EQ(end, &target.back());
    EXPECT_EQ(target.back(), 'x');
    const std::vector<long double> converted = unpack(to, target.data() + 1, values.size());
    for (std::size_t i = 0; i < values.size(); ++i) {
        const long double expected = expectedElement(to, values[i]);
        const bool same =
            std::isnan(expected)
                ? std::isnan(converted[i])
                : converted[i] == expected && std::signbit(converted[i]) == std::signbit(expected);
        if (to.floating || expected != 0) {
            ASSERT_TRUE(same) << values[i] << " of " << from.classID << " to " << to.classID
                              << " is " << converted[i];
        } else {
            ASSERT_EQ(converted[i], 0)
                << values[i] << " of " << from.classID << " to " << to.classID;
        }
    }
}

std::vector<long double> everyValue(const ElementClass& c) {
    std::vector<long double> values;
    for (long double value = c.lowest; value <= c.highest; ++value)
        values.push_back(value);
    return values;
}

// Powers of two up to `digits` binary digits, what lies around them, and the ends of all ranges.
std::vector<long double> wholeBoundaries(int digits) {
    std::vector<long double> values = {0};
    for (int exponent = 0; exponent <= digits; ++exponent) {
        for (const long double offset : {-2.L, -1.L, 0.L, 1.L, 2.L}) {
            values.push_back(std::ldexp(1.L, exponent) + offset);
            values.push_back(-std::ldexp(1.L, exponent) + offset);
        }
    }
    return values;
}

std::vector<long double> integerBoundaries(const ElementClass& c) {
    std::vector<long double> values;
    for (const long double value : wholeBoundaries(64)) {
        if (value >= c.lowest && value <= c.highest) values.push_back(value);
    }
    // Halfway between two singles, and a bit beside: told apart only without a step over double.
    for (const long double value : {0x1.000001p60L, 0x1.000001p60L + 1, 0x1.000003p60L - 1}) {
        if (value <= c.highest) values.push_back(value);
    }
    return values;
}

template <class Floating>
std::vector<long double> floatingBoundaries() {
    using Limits = std::numeric_limits<Floating>;
    constexpr Floating endless = Limits::infinity();
    std::vector<long double> values = {
        -0.0L, nan, inf, -inf, Limits::denorm_min(), Limits::max(), Limits::lowest()};
    for (const long double whole : wholeBoundaries(66)) {
        for (const long double offset : {-0.5L, 0.L, 0.5L}) {
            const auto value = static_cast<Floating>(whole + offset);
            values.insert(values.end(),
                          {value, std::nextafter(value, endless), std::nextafter(value, -endless)});
        }
    }
    return values;
}

std::vector<long double> boundaries(const ElementClass& c) {
    if (c.classID == vxDOUBLE_CLASS) {
        std::vector<long double> values = floatingBoundaries<double>();
        // Between two singles, and beyond the largest.
        for (const double value : {0x1.000001p0, 0x1.0000010000001p0, 0x1.ffffffp127, 1e-46, 1e300})
            values.push_back(value);
        return values;
    }
    if (c.classID == vxSINGLE_CLASS) return floatingBoundaries<float>();
    return c.bytes <= 2 ? everyValue(c) : integerBoundaries(c);
}

// All values of the classes of up to 16 bits, the boundaries of the others, into every class.
TEST(ElementConversion, AgreesWithTheOracleForEveryPairOfClasses) {
    for (const ElementClass& from : classes) {
        const std::vector<long double> values = boundaries(from);
        for (const ElementClass& to : classes)
            checkAgainstOracle(to, from, values);
    }
}

TEST(ElementConversion, RoundsFractionsOfSmallNumbers) {
    std::vector<long double> values;
    for (int i = -300 * 8; i <= 300 * 8; ++i)
        values.push_back(i / 8.0L);
    for (const ElementClass& to : classes)
        checkAgainstOracle(to, classes[2], values);
}

TEST(ElementConversion, CopiesTheSameClassBitByBit) {
    const std::uint64_t payloads[] = {0x7FF0000000000001, 0xFFF8000000001234};
    double doubles[2];
    AssignToVoidBuffer(vxDOUBLE_CLASS, doubles, vxDOUBLE_CLASS, payloads, 2);
    EXPECT_EQ(std::bit_cast<std::uint64_t>(doubles[0]), payloads[0]);
    EXPECT_EQ(std::bit_cast<std::uint64_t>(doubles[1]), payloads[1]);

    const unsigned char seven = 7;
    unsigned char copy = 0;
    AssignToVoidBuffer(vxLOGICAL_CLASS, &copy, vxLOGICAL_CLASS, &seven, 1);
    EXPECT_EQ(copy, 7);
    // Elsewhere any byte but 0 is true, and true is 1.
    AssignToVoidBuffer(vxUINT8_CLASS, &copy, vxLOGICAL_CLASS, &seven, 1);
    EXPECT_EQ(copy, 1);
}

TEST(ElementConversion, RefusesClassesWithoutPlainElements) {
    for (const int other : {-1, 0, 1, 2, 5, 16, 17, 1000}) {
        const auto classID = static_cast<vxClassID>(other);
        double target = 4;
        const double source = 3;
        EXPECT_EQ(AssignToVoidBuffer(classID, &target, vxDOUBLE_CLASS, &source, 1), nullptr);
        EXPECT_EQ(AssignToVoidBuffer(vxDOUBLE_CLASS, &target, classID, &source, 1), nullptr);
        EXPECT_EQ(target, 4) << other;
    }
    double target = 4;
    EXPECT_EQ(AssignToVoidBuffer(vxDOUBLE_CLASS, &target, vxINT8_CLASS, nullptr, 0), &target);
    EXPECT_EQ(AssignToVoidBuffer(vxDOUBLE_CLASS, &target, vxDOUBLE_CLASS, nullptr, 0), &target);
}

TEST(ElementConversion, AnswersForTypeCodesAndClasses) {
    const vxClassID byCode[] = {vxUNKNOWN_CLASS, vxLOGICAL_CLASS, vxCHAR_CLASS,   vxINT8_CLASS,
                                vxINT16_CLASS,   vxINT32_CLASS,   vxINT64_CLASS,  vxUINT8_CLASS,
                                vxUINT16_CLASS,  vxUINT32_CLASS,  vxUINT64_CLASS, vxSINGLE_CLASS,
                                vxDOUBLE_CLASS,  vxUNKNOWN_CLASS};
    for (std::size_t code = 0; code < std::size(byCode); ++code) {
        const std::size_t bytes =
            code == 0 || code == 13 ? 0 : fiPkGetSizeFromClassID(byCode[code]);
        EXPECT_EQ(fiPkGetClassIDFromType(code), byCode[code]) << code;
        EXPECT_EQ(fiPkGetSizeFromType(code), bytes) << code;
    }
    for (const ElementClass& c : classes)
        EXPECT_EQ(fiPkGetSizeFromClassID(c.classID), c.bytes) << c.classID;
    for (const vxClassID other : {vxUNKNOWN_CLASS, vxCELL_CLASS, vxSTRUCT_CLASS, vxOBJECT_CLASS})
        EXPECT_EQ(fiPkGetSizeFromClassID(other), 1u) << other;
}

TEST(ElementConversion, FlipsBytesOfFormatsOfTheOtherOrder) {
    for (int format = 0; format < 8; ++format) {
        EXPECT_EQ(fiNeedsByteFlip(vxDOUBLE_CLASS, format), format % 5 != 0) << format;
        EXPECT_FALSE(fiNeedsByteFlip(vxCHAR_CLASS, format)) << format;
    }
}

TEST(ElementConversion, MakesAndReadsSmallArrays) {
    using embedded::ArrayPtr;
    const struct {
        std::size_t m, n, rows, columns;
    } shapes[] = {{2, 3, 2, 3}, {0, 5, 0, 0}, {5, 0, 0, 0}, {0, 0, 0, 0}};
    for (const auto& shape : shapes) {
        const ArrayPtr array(fiPkCreateNumericMatrix(shape.m, shape.n, vxINT8_CLASS, vxCOMPLEX));
        EXPECT_EQ(vxArrayDimensions(array.get())[0], shape.rows);
        EXPECT_EQ(vxArrayDimensions(array.get())[1], shape.columns);
        EXPECT_EQ(vxArrayClassID(array.get()), vxINT8_CLASS);
    }
    EXPECT_EQ(fiPkScalar2Real(embedded::makeDoubles(1, 2, {2.5, 7}).get(), 1), 2.5);
    EXPECT_EQ(fiPkScalar2Real(embedded::makeDoubles(0, 3, {}).get(), 1), 1);
    EXPECT_EQ(fiPkScalar2Real(embedded::makeRow<std::int8_t>(vxINT8_CLASS, {9}).get(), 1), 1);

    const ArrayPtr bytes(fiPkString2DoubleRowMatrix("a\xFF"));
    EXPECT_EQ(vxArrayDimensions(bytes.get())[0], 1u);
    ASSERT_EQ(vxArrayDimensions(bytes.get())[1], 2u);
    EXPECT_EQ(VxData(bytes.get()).getIndexAs<double>(1), 255);
    const ArrayPtr none(fiPkString2DoubleRowMatrix(""));
    EXPECT_EQ(vxArrayDimensions(none.get())[0], 0u);
    EXPECT_EQ(vxArrayClassID(none.get()), vxDOUBLE_CLASS);
}

}  // namespace
