#pragma once

#include <cstddef>

namespace Orvandeil::FileIO::embedded {

// Blocks of bytes at equal distances.
struct Stride {
    std::size_t blockBytes;
    std::size_t strideBytes;  // from one block to the next
};

// Copies `count` blocks that lie apart behind one another. The places do not overlap.
void pickBlocks(const char* from, const Stride& stride, std::size_t count, char* to);

}  // namespace Orvandeil::FileIO::embedded
