#include "embedded/services/array.h"

#include "embedded/services/memory.h"
#include "fileio/host/memory.h"

#include <numeric>

#include <gtest/gtest.h>

namespace {

using namespace Orvandeil::FileIO::embedded;

Dimensions dimensionsOf(const ArrayPtr& array) {
    const std::size_t* first = vxArrayDimensions(array.get());
    return Dimensions(first, first + vxArrayDimensionCount(array.get()));
}

TEST(HostArrays, NumericClasses) {
    const struct {
        int line;
        vxClassID classID;
        const char* name;
        std::size_t bytes;
    } rows[] = {
        {__LINE__, vxLOGICAL_CLASS, "logical", 1}, {__LINE__, vxCHAR_CLASS, "char", 2},
        {__LINE__, vxDOUBLE_CLASS, "double", 8},   {__LINE__, vxSINGLE_CLASS, "single", 4},
        {__LINE__, vxINT8_CLASS, "int8", 1},       {__LINE__, vxUINT8_CLASS, "uint8", 1},
        {__LINE__, vxINT16_CLASS, "int16", 2},     {__LINE__, vxUINT16_CLASS, "uint16", 2},
        {__LINE__, vxINT32_CLASS, "int32", 4},     {__LINE__, vxUINT32_CLASS, "uint32", 4},
        {__LINE__, vxINT64_CLASS, "int64", 8},     {__LINE__, vxUINT64_CLASS, "uint64", 8},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.line);
        const ArrayPtr array(vxCreateNumericMatrix(2, 3, row.classID, vxCOMPLEX));
        EXPECT_EQ(vxArrayClassID(array.get()), row.classID);
        EXPECT_STREQ(vxArrayClassName(array.get()), row.name);
        EXPECT_EQ(elementBytes(row.classID), row.bytes);
        EXPECT_EQ(vxArrayFirstAsDouble(array.get()), 0);
        EXPECT_TRUE(vxArrayIsComplex(array.get()));
        const auto* bytes = static_cast<const char*>(vxArrayData(array.get()));
        EXPECT_EQ(std::accumulate(bytes, bytes + 6 * row.bytes, 0), 0);
    }
}

TEST(HostArrays, Shapes) {
    const struct {
        int line;
        Dimensions lengths;
        bool vector;
        bool scalar;
        std::size_t count;
    } rows[] = {
        {__LINE__, {1, 1}, true, true, 1},       {__LINE__, {1, 5}, true, false, 5},
        {__LINE__, {5, 1}, true, false, 5},      {__LINE__, {2, 3}, false, false, 6},
        {__LINE__, {0, 0}, false, false, 0},     {__LINE__, {1, 0}, true, false, 0},
        {__LINE__, {2, 3, 4}, false, false, 24}, {__LINE__, {1, 1, 2}, false, false, 2},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.line);
        const ArrayPtr array = makeNumeric(vxINT16_CLASS, row.lengths);
        EXPECT_EQ(dimensionsOf(array), row.lengths);
        EXPECT_EQ(vxArrayIsVector(array.get()), row.vector);
        EXPECT_EQ(vxArrayIsScalar(array.get()), row.scalar);
        EXPECT_EQ(elementCount(*array), row.count);
    }
    EXPECT_EQ(dimensionsOf(makeChars(u"")), (Dimensions{0, 0}));
    EXPECT_EQ(dimensionsOf(makeChars(u"abc")), (Dimensions{1, 3}));
    EXPECT_EQ(dimensionsOf(makeNumeric(vxINT8_CLASS, {})), (Dimensions{1, 1}));
}

TEST(HostArrays, TakeOverBlocks) {
    const std::size_t before = liveBlockCount();
    {
        const ArrayPtr array = makeNumeric(vxUINT8_CLASS, {1, 1});
        auto* block = static_cast<unsigned char*>(vxMemoryAllocateOrRaise(4));
        block[0] = 200;
        vxArraySetData(array.get(), block);
        vxArraySetRows(array.get(), 2);
        vxArraySetColumns(array.get(), 2);
        EXPECT_EQ(liveBlockCount(), before + 1);
        EXPECT_EQ(vxArrayData(array.get()), block);
        EXPECT_EQ(vxArrayFirstAsDouble(array.get()), 200);
        EXPECT_EQ(dimensionsOf(array), (Dimensions{2, 2}));
        vxArraySetData(array.get(), nullptr);
        EXPECT_EQ(liveBlockCount(), before);
    }
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
            ASSERT_NE(subs, nullptr);
            EXPECT_STREQ(vxArrayClassName(subs), "cell");
            EXPECT_EQ(vxArrayFirstAsDouble(cellContent(*subs)), 3);
            EXPECT_EQ(structField(**array, "other"), nullptr);
            EXPECT_EQ(cellContent(**array), nullptr);
        }
        EXPECT_EQ(liveBlockCount(), before + 4);
    }
    EXPECT_EQ(liveBlockCount(), before);
}

}  // namespace
