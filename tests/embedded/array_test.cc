#include "embedded/services/array.h"

#include "embedded/services/memory.h"
#include "fileio/host/memory.h"
#include "tests/support/arrays.h"

#include <gtest/gtest.h>

namespace {

using namespace Orvandeil::FileIO::embedded;
using support::shown;

TEST(HostArrays, NumericClasses) {
    const char* const names[] = {"logical", "char",   "",      "double", "single", "int8",  "uint8",
                                 "int16",   "uint16", "int32", "uint32", "int64",  "uint64"};
    const std::size_t bytes[] = {1, 2, 0, 8, 4, 1, 1, 2, 2, 4, 4, 8, 8};
    for (int i = vxLOGICAL_CLASS; i <= vxUINT64_CLASS; ++i) {
        const auto classID = static_cast<vxClassID>(i);
        EXPECT_EQ(elementBytes(classID), bytes[i - vxLOGICAL_CLASS]);
        if (elementBytes(classID) == 0) continue;
        const ArrayPtr array(vxCreateNumericMatrix(1, 2, classID, vxCOMPLEX));
        EXPECT_EQ(vxArrayClassID(array.get()), classID);
        EXPECT_EQ(shown(array), std::string(names[i - vxLOGICAL_CLASS]) + " 1x2: 0 0 + i 0 0");
        EXPECT_EQ(vxArrayFirstAsDouble(array.get()), 0);
    }
}

std::string shapeOf(const Dimensions& lengths) {
    const ArrayPtr array = makeNumeric(vxINT8_CLASS, lengths);
    return shown(array) + (vxArrayIsVector(array.get()) ? ", vector" : "") +
           (vxArrayIsScalar(array.get()) ? ", scalar" : "");
}

TEST(HostArrays, Shapes) {
    EXPECT_EQ(shapeOf({}), "int8 1x1: 0, vector, scalar");
    EXPECT_EQ(shapeOf({1, 2}), "int8 1x2: 0 0, vector");
    EXPECT_EQ(shapeOf({2, 1}), "int8 2x1: 0 0, vector");
    EXPECT_EQ(shapeOf({2, 2}), "int8 2x2: 0 0 0 0");
    EXPECT_EQ(shapeOf({0, 0}), "int8 0x0: ");
    EXPECT_EQ(shapeOf({1, 0}), "int8 1x0: , vector");
    EXPECT_EQ(shapeOf({1, 1, 2}), "int8 1x1x2: 0 0");
    EXPECT_EQ(shown(makeChars(u"")), "char 0x0: ");
    EXPECT_EQ(shown(makeChars(u"ab")), "char 1x2: 97 98");
}

TEST(HostArrays, TakeOverBlocks) {
    const std::size_t before = liveBlockCount();
    const ArrayPtr array = makeNumeric(vxUINT8_CLASS, {1, 1});
    auto* block = static_cast<unsigned char*>(vxMemoryAllocateOrRaise(2));
    block[0] = 200;
    block[1] = 7;
    vxArraySetData(array.get(), block);
    vxArraySetRows(array.get(), 2);
    vxArraySetColumns(array.get(), 1);
    EXPECT_EQ(liveBlockCount(), before + 1);
    EXPECT_EQ(vxArrayData(array.get()), block);
    EXPECT_EQ(vxArrayFirstAsDouble(array.get()), 200);
    EXPECT_EQ(shown(array), "uint8 2x1: 200 7");
    vxArraySetData(array.get(), nullptr);
    EXPECT_EQ(liveBlockCount(), before);
    vxArrayDestroy(nullptr);
}

TEST(HostArrays, CellsAndStructsOwnTheirContents) {
    const std::size_t before = liveBlockCount();
    {
        const char* const names[] = {"type", "subs"};
        vxArray* const values[] = {makeChars(u"()").release(),
                                   vxCreateCellScalar(makeScalar(3).release())};
        const ArrayPtr structure(vxCreateStructScalar(2, names, values));
        const ArrayPtr copy = copyOf(*structure);
        for (const ArrayPtr* array : {&structure, &copy}) {
            const vxArray* subs = structField(**array, "subs");
            EXPECT_EQ(shown(subs), "cell 1x1: ");
            EXPECT_EQ(shown(cellContent(*subs)), "double 1x1: 3");
            EXPECT_EQ(structField(**array, "other"), nullptr);
            EXPECT_EQ(cellContent(**array), nullptr);
        }
        EXPECT_EQ(liveBlockCount(), before + 4);
    }
    EXPECT_EQ(liveBlockCount(), before);
}

}  // namespace
