#include "fileio/host/memory.h"

#include "examples/own_host/own_host.h"
#include "fileio/host/message_id.h"
#include "fileio/host/messages.h"

#include <algorithm>
#include <cstdlib>
#include <cstring>

namespace own_host {
namespace {

// Stands before every block and keeps its alignment.
struct alignas(std::max_align_t) Header {
    std::size_t bytes;
};

Header* headerOf(void* block) {
    return static_cast<Header*>(block) - 1;
}

}  // namespace

Memory& memory() {
    static Memory account;
    return account;
}

}  // namespace own_host

using own_host::Header;
using own_host::headerOf;
using own_host::memory;

void* vxMemoryAllocate(std::size_t bytes) noexcept {
    if (bytes > memory().limit - memory().bytes) return nullptr;
    auto* header = static_cast<Header*>(std::malloc(sizeof(Header) + bytes));
    if (header == nullptr) return nullptr;
    header->bytes = bytes;
    memory().bytes += bytes;
    ++memory().blocks;
    return header + 1;
}

void* vxMemoryAllocateOrRaise(std::size_t bytes) {
    if (void* block = vxMemoryAllocate(bytes)) return block;
    vxMemoryRaiseExhausted();
}

void* vxMemoryAllocateZeroedOrRaise(std::size_t count, std::size_t size) {
    std::size_t bytes = 0;
    if (__builtin_mul_overflow(count, size, &bytes)) vxMemoryRaiseExhausted();
    return std::memset(vxMemoryAllocateOrRaise(bytes), 0, bytes);
}

// A resized block always moves: whoever kept the old place finds out.
void* vxMemoryReallocateOrRaise(void* block, std::size_t bytes) {
    void* moved = vxMemoryAllocateOrRaise(bytes);
    if (block != nullptr) std::memcpy(moved, block, std::min(bytes, headerOf(block)->bytes));
    vxMemoryFree(block);
    return moved;
}

void vxMemoryFree(void* block) noexcept {
    if (block == nullptr) return;
    memory().bytes -= headerOf(block)->bytes;
    --memory().blocks;
    std::free(headerOf(block));
}

void vxMemoryRaiseExhausted() {
    vxErrMsgId(foundation::core::except::BaseMsgID("OWN", "outOfMemory"));
}
