#include "embedded/services/array.h"
#include "embedded/services/dispatch.h"
#include "embedded/services/memory.h"
#include "fileio/host/memory.h"
#include "tests/support/arrays.h"
#include "tests/support/raised.h"

#include <cmath>
#include <cstdint>
#include <cstring>
#include <functional>

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

TEST(HostMemory, EmptyBlocksAreBlocks) {
    const std::size_t before = liveBlockCount();
    void* blocks[] = {vxMemoryAllocate(0), vxMemoryAllocateOrRaise(0),
                      vxMemoryAllocateZeroedOrRaise(0, 8), vxMemoryReallocateOrRaise(nullptr, 0)};
    EXPECT_EQ(liveBlockCount(), before + 4);
    blocks[0] = vxMemoryReallocateOrRaise(blocks[0], 0);
    for (void* block : blocks) {
        EXPECT_NE(block, nullptr);
        vxMemoryFree(block);
    }
    vxMemoryFree(nullptr);
    EXPECT_EQ(liveBlockCount(), before);
}

TEST(HostMemory, SizesThatNoBlockCanHave) {
    void* block = vxMemoryAllocateOrRaise(5);
    std::memcpy(block, "kept", 5);
    EXPECT_EQ(vxMemoryAllocate(SIZE_MAX), nullptr);
    EXPECT_THROW(vxMemoryAllocateOrRaise(SIZE_MAX), OutOfMemoryError);
    EXPECT_THROW(vxMemoryReallocateOrRaise(block, SIZE_MAX), OutOfMemoryError);
    EXPECT_STREQ(static_cast<char*>(block), "kept");
    vxMemoryFree(block);
    EXPECT_EQ(fileio_tests::raisedBy(vxMemoryRaiseExhausted), "KESTRA:nomem");
}

TEST(HostMemory, EveryKindOfAllocationCanFail) {
    void* block = vxMemoryAllocateOrRaise(8);
    const std::function<void()> allocations[] = {
        [] { vxMemoryFree(vxMemoryAllocateOrRaise(8)); },
        [] { vxMemoryFree(vxMemoryAllocateZeroedOrRaise(8, 8)); },
        [&] { block = vxMemoryReallocateOrRaise(block, 16); },
    };
    for (const auto& allocate : allocations) {
        for (const auto extent : {FailingAllocation::Once, FailingAllocation::Onwards}) {
            FailingAllocation second(2, extent);
            EXPECT_NO_THROW(allocate());
            EXPECT_FALSE(second.happened());
            EXPECT_THROW(allocate(), OutOfMemoryError);
            EXPECT_TRUE(second.happened());
            const bool failsAgain = fileio_tests::raisedBy(allocate) != "";
            EXPECT_EQ(failsAgain, extent == FailingAllocation::Onwards);
        }
        EXPECT_NO_THROW(allocate());
    }
    vxMemoryFree(block);
}

// What the function returns or raises.
template <class... Inputs>
std::string call(const char* name, const Inputs&... inputs) {
    const std::vector<const vxArray*> list = {inputs.get()...};
    std::string result;
    const std::string raised = fileio_tests::raisedBy(
        [&] { result = support::shown(ArrayPtr(vxDispatchCall(name, list.data(), list.size()))); });
    return raised + result;
}

ArrayPtr subscriptOf(ArrayPtr index) {
    const char* const names[] = {"type", "subs"};
    vxArray* const values[] = {makeChars(u"()").release(), vxCreateCellScalar(index.release())};
    return ArrayPtr(vxCreateStructScalar(2, names, values));
}

TEST(Dispatch, StringElements) {
    const ArrayPtr strings = makeStrings({u"one", std::nullopt, u""}, {3, 1});
    EXPECT_EQ(call("size", strings), "double 1x2: 3 1");
    const char* const elements[] = {"'one'", "missing", "''"};
    for (const int i : {1, 2, 3}) {
        EXPECT_EQ(call("subsref", strings, subscriptOf(makeScalar(i))),
                  std::string("string 1x1: ") + elements[i - 1]);
    }
    for (const double bad : {0.0, 4.0, 1.5, -1.0, double(NAN), double(INFINITY)})
        EXPECT_EQ(call("subsref", strings, subscriptOf(makeScalar(bad))), "KESTRA:badsubscript");
    EXPECT_EQ(call("subsref", strings, subscriptOf(makeDoubles(1, 2, {1, 2}))),
              "KESTRA:badsubscript");
}

TEST(Dispatch, Conversions) {
    EXPECT_EQ(call("int8", makeString(u"4e1")), "none");
    EXPECT_EQ(call("char", makeStrings({u"a", u"b"}, {1, 2})),
              "KESTRA:string:MustBeStringScalarOrCharacterVector");
    EXPECT_EQ(call("double", makeRow<std::int8_t>(vxINT8_CLASS, {-3, 5})), "double 1x2: -3 5");
    const ArrayPtr complex = makeNumeric(vxSINGLE_CLASS, {1, 1, 2}, vxCOMPLEX);
    *static_cast<float*>(imaginaryData(*complex)) = 2.5F;
    EXPECT_EQ(call("size", complex), "double 1x3: 1 1 2");
    EXPECT_EQ(call("double", complex), "double 1x1x2: 0 0 + i 2.5 0");
}

TEST(Dispatch, ObjectsAnswerByTheirOwnTable) {
    const ArrayPtr widget = makeObject(
        "Widget",
        {{"size", [](auto) { return makeScalar(7); }},
         {"double", [](auto inputs) { return makeScalar(static_cast<double>(inputs.size())); }}});
    EXPECT_EQ(support::shown(widget), "Widget 1x1: ");
    EXPECT_EQ(call("size", widget), "double 1x1: 7");
    EXPECT_EQ(call("double", widget, widget), "double 1x1: 2");
    EXPECT_EQ(call("char", widget), "none");
    EXPECT_EQ(call("size"), "none");
    EXPECT_EQ(call("double", makeObject("Plain", {})), "none");
}

}  // namespace
