#include "benchmarks/huge_block.h"

#include <algorithm>
#include <cstdlib>
#include <new>

#include <sys/mman.h>

namespace bench {

HugeBlock::HugeBlock(std::size_t size) : bytes(std::max<std::size_t>(size, 1)) {
    constexpr std::size_t hugePage = 2 << 20;
    const std::size_t rounded = (bytes + hugePage - 1) / hugePage * hugePage;
    memory = std::aligned_alloc(hugePage, rounded);
    if (!memory) throw std::bad_alloc();
    madvise(memory, rounded, MADV_HUGEPAGE);
}

HugeBlock::~HugeBlock() {
    std::free(memory);
}

}  // namespace bench
