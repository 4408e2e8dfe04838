#pragma once

#include "fileio/host/memory.h"

#include <cstddef>

namespace Orvandeil::FileIO {

// Base of the library's own objects: they live in the host's memory, so that the host can account
// for them and limit them. Exhaustion is the host's own out-of-memory error, never std::bad_alloc.
class fiMemoryOperationOverloads {
public:
    static void* operator new(std::size_t bytes) { return vxMemoryAllocateOrRaise(bytes); }
    static void* operator new[](std::size_t bytes) { return vxMemoryAllocateOrRaise(bytes); }
    static void* operator new(std::size_t, void* place) noexcept { return place; }
    static void operator delete(void* block) noexcept { vxMemoryFree(block); }
    static void operator delete[](void* block) noexcept { vxMemoryFree(block); }
    static void operator delete(void*, void*) noexcept {}
};

}  // namespace Orvandeil::FileIO
