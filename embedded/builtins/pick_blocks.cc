#include "embedded/builtins/pick_blocks.h"

#include <cstring>

namespace Orvandeil::FileIO::embedded {
namespace {

template <std::size_t blockBytes>
void pick(const char* __restrict from, std::size_t strideBytes, std::size_t count,
          char* __restrict to) {
    for (std::size_t i = 0; i < count; ++i)
        std::memcpy(to + i * blockBytes, from + i * strideBytes, blockBytes);
}

// Distances known beforehand make it a loop over vectors.
template <std::size_t blockBytes>
void pickKnown(const char* from, std::size_t strideBytes, std::size_t count, char* to) {
    switch (strideBytes) {
        case 2 * blockBytes:
            return pick<blockBytes>(from, 2 * blockBytes, count, to);
        case 4 * blockBytes:
            return pick<blockBytes>(from, 4 * blockBytes, count, to);
        case 8 * blockBytes:
            return pick<blockBytes>(from, 8 * blockBytes, count, to);
        default:
            return pick<blockBytes>(from, strideBytes, count, to);
    }
}

}  // namespace

void pickBlocks(const char* from, const Stride& stride, std::size_t count, char* to) {
    switch (stride.blockBytes) {
        case 1:
            return pickKnown<1>(from, stride.strideBytes, count, to);
        case 2:
            return pickKnown<2>(from, stride.strideBytes, count, to);
        case 4:
            return pickKnown<4>(from, stride.strideBytes, count, to);
        case 8:
            return pickKnown<8>(from, stride.strideBytes, count, to);
        default:
            for (std::size_t i = 0; i < count; ++i)
                std::memcpy(to + i * stride.blockBytes, from + i * stride.strideBytes,
                            stride.blockBytes);
    }
}

}  // namespace Orvandeil::FileIO::embedded
