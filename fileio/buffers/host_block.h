#pragma once

#include "fileio/host/memory.h"

#include <memory>

namespace Orvandeil::FileIO::detail {

struct HostBlockFreer {
    void operator()(void* block) const noexcept { vxMemoryFree(block); }
};

// Bytes of the host's memory that end with their scope.
using HostBytes = std::unique_ptr<char[], HostBlockFreer>;

}  // namespace Orvandeil::FileIO::detail
