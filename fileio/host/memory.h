#pragma once

#include "fileio/export.h"

#include <cstddef>

// Memory of the host. Whatever may end up as the storage of a host array is taken here, so that
// ownership can pass to the array without a copy. Blocks are aligned for any fundamental type.
// Functions named "...OrRaise" never return null: they raise the host's out-of-memory error.

// A new block of at least `bytes` bytes (0 gives a valid block too), or null.
FILEIO_API void* vxMemoryAllocate(std::size_t bytes) noexcept;

// The same, raising instead of returning null.
FILEIO_API void* vxMemoryAllocateOrRaise(std::size_t bytes);

// `count` elements of `size` bytes, all zero. A product beyond the address space raises.
FILEIO_API void* vxMemoryAllocateZeroedOrRaise(std::size_t count, std::size_t size);

// Resizes `block` (null: a new one) to `bytes` bytes and keeps its leading contents. 0 bytes keep
// a valid block. When it raises, `block` is still there, unchanged.
FILEIO_API void* vxMemoryReallocateOrRaise(void* block, std::size_t bytes);

// Gives a block back; null is allowed.
FILEIO_API void vxMemoryFree(void* block) noexcept;

// The host's out-of-memory error, for sizes that no block can have. Does not return.
[[noreturn]] FILEIO_API void vxMemoryRaiseExhausted();
