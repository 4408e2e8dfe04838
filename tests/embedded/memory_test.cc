#include "embedded/services/memory.h"

#include "embedded/services/array.h"
#include "tests/support/raised.h"

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

}  // namespace
