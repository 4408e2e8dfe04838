#include "embedded/services/memory.h"

#include "fileio/host/messages.h"

#include <algorithm>
#include <atomic>
#include <cerrno>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <malloc.h>

#include <sys/mman.h>
#if __has_include(<sys/single_threaded.h>)
#include <sys/single_threaded.h>
#endif

namespace Orvandeil::FileIO::embedded {
namespace {

constexpr std::size_t largestBlock = PTRDIFF_MAX;

std::atomic<std::size_t> liveBlocks = 0;

bool isSingleThreaded() {
#if __has_include(<sys/single_threaded.h>)
    return __libc_single_threaded != 0;
#else
    return false;
#endif
}

// An atomic addition costs about as much as the allocation that it counts.
void countBlocks(std::ptrdiff_t change) {
    const auto added = static_cast<std::size_t>(change);
    if (isSingleThreaded()) {
        liveBlocks.store(liveBlocks.load(std::memory_order_relaxed) + added,
                         std::memory_order_relaxed);
    } else {
        liveBlocks += added;
    }
}

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
    if (block != nullptr) countBlocks(1);
    return block;
}

// Asks for huge pages below a large block: most of the time that filling a new one takes goes into
// page faults otherwise. It is advice, so that nothing depends on the answer. The pages at both
// ends are among them: a mapping of two kinds of pages can no longer be moved to where it can grow,
// and would be copied.
void* advised(void* block, [[maybe_unused]] std::size_t bytes) {
#ifdef FILEIO_FAST_PATHS
    constexpr std::size_t leastBytes = std::size_t{4} << 20;
    constexpr std::uintptr_t pageBytes = 4096;
    if (block == nullptr || bytes < leastBytes) return block;
    const auto start = reinterpret_cast<std::uintptr_t>(block);
    const std::uintptr_t firstPage = start / pageBytes * pageBytes;
    const std::uintptr_t end = (start + bytes + pageBytes - 1) / pageBytes * pageBytes;
    const int keptErrno = errno;
    madvise(reinterpret_cast<void*>(firstPage), end - firstPage, MADV_HUGEPAGE);
    errno = keptErrno;
#endif
    return block;
}

// A large block that keeps most of its size stays as it is: pages that were never written take no
// memory, and the allocator learns from the size of what is freed which sizes come back.
bool isCutLittle([[maybe_unused]] void* block, [[maybe_unused]] std::size_t bytes) {
#ifdef FILEIO_FAST_PATHS
    constexpr std::size_t leastBytes = std::size_t{128} << 10;
    if (bytes < leastBytes) return false;
    const std::size_t present = malloc_usable_size(block);
    return bytes <= present && bytes >= present / 2;
#else
    return false;
#endif
}

// A small block that shrinks a lot is copied: cut in place it would leave a rest of an odd size,
// and the next block of the old size could not be taken from the allocator's lists of free ones.
void* resized(void* block, std::size_t bytes) {
#ifdef FILEIO_FAST_PATHS
    constexpr std::size_t mostBytes = 16384;
    const std::size_t present = malloc_usable_size(block);
    if (present <= mostBytes && bytes <= present / 4) {
        void* const copy = std::malloc(bytes);
        if (copy == nullptr) return nullptr;
        std::memcpy(copy, block, bytes);
        std::free(block);
        return copy;
    }
#endif
    return std::realloc(block, bytes);
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
    return counted(advised(std::malloc(std::max<std::size_t>(bytes, 1)), bytes));
}

void* vxMemoryAllocateOrRaise(std::size_t bytes) {
    if (void* block = vxMemoryAllocate(bytes)) return block;
    vxMemoryRaiseExhausted();
}

void* vxMemoryAllocateZeroedOrRaise(std::size_t count, std::size_t size) {
    std::size_t bytes = 0;
    const bool tooLarge = __builtin_mul_overflow(count, size, &bytes) || bytes > largestBlock;
    if (!tooLarge && mayAllocate()) {
        void* const block = std::calloc(std::max<std::size_t>(bytes, 1), 1);
        if (block != nullptr) return counted(advised(block, bytes));
    }
    vxMemoryRaiseExhausted();
}

void* vxMemoryReallocateOrRaise(void* block, std::size_t bytes) {
    if (block == nullptr) return vxMemoryAllocateOrRaise(bytes);
    if (bytes <= largestBlock && mayAllocate()) {
        if (isCutLittle(block, bytes)) return block;
        void* const moved = resized(block, std::max<std::size_t>(bytes, 1));
        if (moved != nullptr) return advised(moved, bytes);
    }
    vxMemoryRaiseExhausted();
}

void vxMemoryFree(void* block) noexcept {
    if (block == nullptr) return;
    countBlocks(-1);
    std::free(block);
}

void vxMemoryRaiseExhausted() {
    vxErrMsgId(OutOfMemory());
}
