#include "fileio/buffers/element_conversion.h"

#include "embedded/services/array.h"
#include "tests/oracle/conversion_oracle.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <vector>

#include <gtest/gtest.h>

namespace {

using namespace Orvandeil::FileIO;
using detail::Logical;
using embedded::ArrayPtr;

// The halves around all powers of two, and what is about halfway between two singles, where a step
// over double would round twice.
std::vector<long double> boundaries() {
    constexpr long double odd[] = {0x1.000001p60L,
                                   0x1.000001p60L + 1,
                                   0x1.000003p60L - 1,
                                   0x1.000001p0L,
                                   0x1.0000010000001p0L,
                                   0x1.ffffffp127L,
                                   1e300L,
                                   5e-324L,
                                   -0.L,
                                   HUGE_VALL,
                                   -HUGE_VALL};
    std::vector<long double> values(std::begin(odd), std::end(odd));
    for (int exponent = 0; exponent <= 66; ++exponent) {
        for (long double offset = -2; offset <= 2; offset += 0.5L) {
            values.push_back(std::ldexp(1.L, exponent) + offset);
            values.push_back(-values.back());
        }
    }
    return values;
}

// All values of up to 16 bits, else the boundaries in range and, of floating classes, the
// neighbours of these and a signalling NaN.
template <class Element>
std::vector<Element> samples() {
    std::vector<Element> elements;
    if constexpr (sizeof(Element) <= 2) {
        for (int bits = 0; bits < 1 << 8 * sizeof(Element); ++bits)
            elements.push_back(static_cast<Element>(bits));
    } else {
        using Limits = std::numeric_limits<Element>;
        for (const long double value : boundaries()) {
            constexpr bool isFloating = std::is_floating_point_v<Element>;
            if (!isFloating && (value < Limits::lowest() || value > Limits::max())) continue;
            const auto element = static_cast<Element>(value);
            elements.push_back(element);
            if constexpr (isFloating) {
                elements.push_back(std::nextafter(element, Limits::infinity()));
                elements.push_back(std::nextafter(element, -Limits::infinity()));
            }
        }
        if constexpr (Limits::has_signaling_NaN) elements.push_back(Limits::signaling_NaN());
    }
    return elements;
}

template <class From>
void checkFrom(vxClassID from) {
    const std::vector<From> elements = samples<From>();
#define CHECK_PAIR(to, To) oracle::checkRun<To, From>(to, from, elements);
    FILEIO_FOR_EACH_ELEMENT(CHECK_PAIR)
#undef CHECK_PAIR
}

TEST(ElementConversion, AgreesWithTheOracleForEveryPairOfClasses) {
#define CHECK_FROM(from, From) checkFrom<From>(from);
    FILEIO_FOR_EACH_ELEMENT(CHECK_FROM)
#undef CHECK_FROM
}

TEST(ElementConversion, RefusesClassesWithoutPlainElements) {
    double target = 4;
    const double source = 3;
    for (const int other : {-1, 0, 1, 2, 5, 16, 17, 1000}) {
        const auto classID = static_cast<vxClassID>(other);
        EXPECT_EQ(AssignToVoidBuffer(classID, &target, vxDOUBLE_CLASS, &source, 1), nullptr);
        EXPECT_EQ(AssignToVoidBuffer(vxDOUBLE_CLASS, &target, classID, &source, 1), nullptr);
    }
    EXPECT_EQ(target, 4);
    EXPECT_EQ(AssignToVoidBuffer(vxDOUBLE_CLASS, &target, vxINT8_CLASS, nullptr, 0), &target);
    EXPECT_EQ(AssignToVoidBuffer(vxDOUBLE_CLASS, &target, vxDOUBLE_CLASS, nullptr, 0), &target);
}

TEST(ElementConversion, AnswersForTypeCodesAndClasses) {
#define CHECK_SIZE(classID, Type) EXPECT_EQ(fiPkGetSizeFromClassID(classID), sizeof(Type));
    FILEIO_FOR_EACH_ELEMENT(CHECK_SIZE)
#undef CHECK_SIZE
    for (std::size_t code = 0; code < 15; ++code) {
        const vxClassID classID = fiPkGetClassIDFromType(code);
        EXPECT_EQ(classID == vxUNKNOWN_CLASS, code % 13 == 0 || code > 13) << code;
        EXPECT_EQ(fiPkGetSizeFromType(code),
                  classID == vxUNKNOWN_CLASS ? 0 : fiPkGetSizeFromClassID(classID))
            << code;
    }
    for (const vxClassID other : {vxUNKNOWN_CLASS, vxCELL_CLASS, vxSTRUCT_CLASS, vxOBJECT_CLASS})
        EXPECT_EQ(fiPkGetSizeFromClassID(other), 1u) << other;
    for (int format = 0; format < 8; ++format) {
        EXPECT_EQ(fiNeedsByteFlip(vxDOUBLE_CLASS, format), format % 5 != 0) << format;
        EXPECT_FALSE(fiNeedsByteFlip(vxCHAR_CLASS, format)) << format;
    }
}

TEST(ElementConversion, MakesAndReadsSmallArrays) {
    const auto shape = [](vxArray* array) {
        const ArrayPtr owned(array);
        const std::size_t* lengths = vxArrayDimensions(array);
        return std::to_string(lengths[0]) + 'x' + std::to_string(lengths[1]);
    };
    EXPECT_EQ(shape(fiPkCreateNumericMatrix(2, 3, vxINT8_CLASS, vxCOMPLEX)), "2x3");
    EXPECT_EQ(shape(fiPkCreateNumericMatrix(0, 3, vxINT8_CLASS, vxREAL)), "0x0");
    EXPECT_EQ(shape(fiPkCreateNumericMatrix(3, 0, vxINT8_CLASS, vxREAL)), "0x0");
    EXPECT_EQ(shape(fiPkString2DoubleRowMatrix("")), "0x0");
    EXPECT_EQ(shape(fiPkString2DoubleRowMatrix("a\xFF")), "1x2");
    const ArrayPtr bytes(fiPkString2DoubleRowMatrix("\xFF"));
    EXPECT_EQ(fiPkScalar2Real(bytes.get(), 1), 255);
    EXPECT_EQ(fiPkScalar2Real(embedded::makeDoubles(0, 3, {}).get(), 1), 1);
    EXPECT_EQ(fiPkScalar2Real(embedded::makeRow<std::int8_t>(vxINT8_CLASS, {9}).get(), 1), 1);
}

}  // namespace
