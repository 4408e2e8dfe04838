#include "fileio/buffers/element_conversion.h"

#include "embedded/services/array.h"
#include "fileio/buffers/convert_element.h"

#include <algorithm>
#include <bit>
#include <cmath>
#include <cstring>
#include <limits>
#include <vector>

#include <gtest/gtest.h>

namespace {

using namespace Orvandeil::FileIO;
using detail::Logical;

// The oracle computes in extended numbers, which hold every element of every class exactly.
template <class To>
long double expectedElement(long double value) {
    if constexpr (std::is_floating_point_v<To>) return static_cast<To>(value);
    using Limits = std::numeric_limits<detail::Number<To>>;
    const long double highest = std::is_same_v<To, Logical> ? 1 : Limits::max();
    if (std::isnan(value)) return 0;
    // The sum turns -0, which no integer is, into 0.
    return std::clamp(std::round(value), static_cast<long double>(Limits::min()), highest) + 0.L;
}

template <class Element>
void pushInRange(std::vector<Element>& elements, long double value) {
    using Limits = std::numeric_limits<detail::Number<Element>>;
    if (value < Limits::lowest() || value > Limits::max()) return;
    elements.push_back(static_cast<Element>(static_cast<detail::Number<Element>>(value)));
}

// Around all powers of two; for floating classes with halves and the neighbours of all of these.
template <class Element>
std::vector<Element> boundaries() {
    std::vector<Element> elements;
    for (int exponent = 0; exponent <= 66; ++exponent) {
        for (const long double offset : {-2.L, -1.5L, -1.L, -0.5L, 0.L, 0.5L, 1.L, 1.5L, 2.L}) {
            pushInRange(elements, std::ldexp(1.L, exponent) + offset);
            pushInRange(elements, -std::ldexp(1.L, exponent) + offset);
        }
    }
    if constexpr (std::is_floating_point_v<Element>) {
        using Limits = std::numeric_limits<Element>;
        const std::size_t count = elements.size();
        for (std::size_t i = 0; i < count; ++i) {
            elements.push_back(std::nextafter(elements[i], Limits::infinity()));
            elements.push_back(std::nextafter(elements[i], -Limits::infinity()));
        }
        elements.insert(elements.end(), {-Element{0}, Limits::infinity(), -Limits::infinity(),
                                         Limits::quiet_NaN(), Limits::denorm_min(), Limits::max()});
        for (Element eighths = -2400; eighths <= 2400; ++eighths)
            elements.push_back(eighths / 8);
    }
    // About halfway between two singles, where a step over double would round twice.
    for (const long double value : {0x1.000001p60L, 0x1.000001p60L + 1, 0x1.000003p60L - 1,
                                    0x1.000001p0L, 0x1.0000010000001p0L, 0x1.ffffffp127L})
        pushInRange(elements, value);
    return elements;
}

template <class Element>
std::vector<Element> samples() {
    if constexpr (sizeof(Element) > 2) {
        return boundaries<Element>();
    } else {
        std::vector<Element> elements;
        const int count = std::is_same_v<Element, Logical> ? 2 : 1 << 8 * sizeof(Element);
        for (int bits = 0; bits < count; ++bits)
            elements.push_back(static_cast<Element>(bits));
        return elements;
    }
}

bool isSame(long double one, long double other) {
    if (std::isnan(one)) return std::isnan(other);
    return one == other && (one != 0 || std::signbit(one) == std::signbit(other));
}

// Converts with both blocks off any alignment, and compares every element.
template <class To, class From>
void checkPair(vxClassID to, vxClassID from, const std::vector<From>& elements) {
    std::vector<char> source(1 + elements.size() * sizeof(From));
    std::memcpy(source.data() + 1, elements.data(), source.size() - 1);
    std::vector<char> target(2 + elements.size() * sizeof(To), 'x');
    void* end = AssignToVoidBuffer(to, target.data() + 1, from, source.data() + 1, elements.size());
    ASSERT_EQ(end, &target.back());
    EXPECT_EQ(target.back(), 'x');
    for (std::size_t i = 0; i < elements.size(); ++i) {
        const auto value = static_cast<long double>(elements[i]);
        const auto result = static_cast<long double>(detail::loadElement<To>(target.data() + 1, i));
        const long double expected = expectedElement<To>(value);
        ASSERT_TRUE(isSame(result, expected))
            << value << " of class " << from << " to " << to << " is " << result;
    }
}

template <class From>
void checkFrom(vxClassID from) {
    const std::vector<From> elements = samples<From>();
#define CHECK_PAIR(to, To) checkPair<To, From>(to, from, elements);
    FILEIO_FOR_EACH_ELEMENT(CHECK_PAIR)
#undef CHECK_PAIR
}

// All values of the classes of up to 16 bits, the boundaries of the others, into every class.
TEST(ElementConversion, AgreesWithTheOracleForEveryPairOfClasses) {
#define CHECK_FROM(from, From) checkFrom<From>(from);
    FILEIO_FOR_EACH_ELEMENT(CHECK_FROM)
#undef CHECK_FROM
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
#define CHECK_SIZE(classID, Type) EXPECT_EQ(fiPkGetSizeFromClassID(classID), sizeof(Type));
    FILEIO_FOR_EACH_ELEMENT(CHECK_SIZE)
#undef CHECK_SIZE
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
