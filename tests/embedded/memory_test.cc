#include "embedded/services/memory.h"

#include "embedded/services/array.h"

#include <cstdint>
#include <cstring>
#include <functional>

#include <gtest/gtest.h>

namespace {

using namespace Orvandeil::FileIO::embedded;

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
    char kept[] = "kept";
    void* block = vxMemoryAllocateOrRaise(sizeof kept);
    std::memcpy(block, kept, sizeof kept);
    EXPECT_EQ(vxMemoryAllocate(SIZE_MAX), nullptr);
    EXPECT_THROW(vxMemoryAllocateOrRaise(SIZE_MAX), OutOfMemoryError);
    EXPECT_THROW(vxMemoryAllocateZeroedOrRaise(SIZE_MAX / 4, 8), OutOfMemoryError);
    EXPECT_THROW(vxMemoryReallocateOrRaise(block, SIZE_MAX), OutOfMemoryError);
    EXPECT_STREQ(static_cast<char*>(block), kept);
    vxMemoryFree(block);
    EXPECT_THROW(vxCreateNumericMatrix(SIZE_MAX / 2, 3, vxINT8_CLASS, vxREAL), OutOfMemoryError);
}

TEST(HostMemory, TheErrorNamesItself) {
    try {
        vxMemoryRaiseExhausted();
    } catch (const foundation::core::except::IMsgIDException& error) {
        EXPECT_EQ(error.GetID(), "KESTRA:nomem");
        EXPECT_STREQ(error.what(), "There is not enough memory.");
    }
}

TEST(HostMemory, EveryKindOfAllocationCanFail) {
    void* block = vxMemoryAllocateOrRaise(8);
    const std::function<void()> allocations[] = {
        [] { vxMemoryFree(vxMemoryAllocateOrRaise(8)); },
        [] { vxMemoryFree(vxMemoryAllocateZeroedOrRaise(8, 8)); },
        [&] { block = vxMemoryReallocateOrRaise(block, 16); },
    };
    for (const auto& allocate : allocations) {
        {
            FailingAllocation second(2);
            EXPECT_NO_THROW(allocate());
            EXPECT_FALSE(second.happened());
            EXPECT_THROW(allocate(), OutOfMemoryError);
            EXPECT_TRUE(second.happened());
            EXPECT_NO_THROW(allocate());
        }
        {
            FailingAllocation everyOne(1, FailingAllocation::Onwards);
            EXPECT_THROW(allocate(), OutOfMemoryError);
            EXPECT_THROW(allocate(), OutOfMemoryError);
        }
        EXPECT_NO_THROW(allocate());
    }
    vxMemoryFree(block);
}

TEST(HostMemory, ArraysLoseNothingWhenAnAllocationFails) {
    const std::size_t before = liveBlockCount();
    for (std::size_t n = 1;; ++n) {
        FailingAllocation failure(n);
        try {
            const ArrayPtr array = makeNumeric(vxDOUBLE_CLASS, {2, 3}, vxCOMPLEX);
            copyOf(*array);
        } catch (const OutOfMemoryError&) {
        }
        EXPECT_EQ(liveBlockCount(), before);
        if (!failure.happened()) break;
        ASSERT_LT(n, 10u);
    }
}

}  // namespace
