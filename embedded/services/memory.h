#pragma once

#include "fileio/export.h"
#include "fileio/host/exception.h"
#include "fileio/host/memory.h"
#include "fileio/host/message_id.h"

#include <cstddef>

// What the embedded host adds to its allocator: counters, and allocations that fail on demand.
namespace Orvandeil::FileIO::embedded {

// "KESTRA:nomem", the identifier of an exhausted host.
class FILEIO_API OutOfMemory : public foundation::core::except::BaseMsgID {
public:
    OutOfMemory() : BaseMsgID("KESTRA", "nomem") {}
};
using OutOfMemoryError = foundation::core::except::Exception<OutOfMemory, std::exception>;

// Blocks that were handed out and not yet given back.
FILEIO_API std::size_t liveBlockCount();

// While it lives, the n-th allocation or reallocation from now on (counted from 1) fails, and with
// `Onwards` every later one too. They do not nest: the newest decides.
class FILEIO_API FailingAllocation {
public:
    enum Extent { Once, Onwards };

    explicit FailingAllocation(std::size_t nth, Extent extent = Once);
    ~FailingAllocation();
    FailingAllocation(const FailingAllocation&) = delete;
    FailingAllocation& operator=(const FailingAllocation&) = delete;

    // Whether the n-th allocation was reached.
    bool happened() const;
};

}  // namespace Orvandeil::FileIO::embedded
