#include "embedded/services/memory.h"

#include "fileio/host/messages.h"

#include <algorithm>
#include <atomic>
#include <cstdint>
#include <cstdlib>

namespace Orvandeil::FileIO::embedded {
namespace {

constexpr std::size_t largestBlock = PTRDIFF_MAX;

std::atomic<std::size_t> liveBlocks = 0;

// Allocations left up to and including the one that fails; 0 while none is to fail.
std::atomic<std::size_t> allocationsToFailure = 0;
std::atomic<bool> failureGoesOn = false;
std::atomic<bool> failureHappened = false;

bool mayAllocate() {
    const std::size_t left = allocationsToFailure.load();
    if (left == 0) return true;
    if (left > 1) {
        allocationsToFailure = left - 1;
        return true;
    }
    failureHappened = true;
    if (!failureGoesOn) allocationsToFailure = 0;
    return false;
}

void* counted(void* block) {
    if (block != nullptr) ++liveBlocks;
    return block;
}

}  // namespace

std::size_t liveBlockCount() {
    return liveBlocks;
}

FailingAllocation::FailingAllocation(std::size_t nth, Extent extent) {
    failureGoesOn = extent == Onwards;
    failureHappened = false;
    allocationsToFailure = nth;
}

FailingAllocation::~FailingAllocation() {
    allocationsToFailure = 0;
}

bool FailingAllocation::happened() const {
    return failureHappened;
}

}  // namespace Orvandeil::FileIO::embedded

using namespace Orvandeil::FileIO::embedded;

void* vxMemoryAllocate(std::size_t bytes) noexcept {
    if (bytes > largestBlock || !mayAllocate()) return nullptr;
    return counted(std::malloc(std::max<std::size_t>(bytes, 1)));
}

void* vxMemoryAllocateOrRaise(std::size_t bytes) {
    if (void* block = vxMemoryAllocate(bytes)) return block;
    vxMemoryRaiseExhausted();
}

void* vxMemoryAllocateZeroedOrRaise(std::size_t count, std::size_t size) {
    std::size_t bytes = 0;
    const bool tooLarge = __builtin_mul_overflow(count, size, &bytes) || bytes > largestBlock;
    if (!tooLarge && mayAllocate()) {
        if (void* block = counted(std::calloc(std::max<std::size_t>(bytes, 1), 1))) return block;
    }
    vxMemoryRaiseExhausted();
}

void* vxMemoryReallocateOrRaise(void* block, std::size_t bytes) {
    if (block == nullptr) return vxMemoryAllocateOrRaise(bytes);
    if (bytes <= largestBlock && mayAllocate()) {
        if (void* moved = std::realloc(block, std::max<std::size_t>(bytes, 1))) return moved;
    }
    vxMemoryRaiseExhausted();
}

void vxMemoryFree(void* block) noexcept {
    if (block == nullptr) return;
    --liveBlocks;
    std::free(block);
}

void vxMemoryRaiseExhausted() {
    vxErrMsgId(OutOfMemory());
}
