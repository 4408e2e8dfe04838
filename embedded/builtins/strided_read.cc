#include "embedded/builtins/strided_read.h"

#include "fileio/constants.h"

#include <algorithm>
#include <cstring>
#include <vector>

namespace Orvandeil::FileIO::embedded {
namespace {

// Reading on costs less than positioning up to about here.
constexpr unsigned long longestSkipRead = 16384;

// Copies `count` blocks of blockBytes bytes; a size known beforehand makes it a plain load.
template <std::size_t blockBytes>
void pickBlocks(const char* from, std::size_t strideBytes, unsigned long count, char* to) {
    for (unsigned long i = 0; i < count; ++i)
        std::memcpy(to + i * blockBytes, from + i * strideBytes, blockBytes);
}

void pick(const char* from, std::size_t strideBytes, std::size_t blockBytes, unsigned long count,
          char* to) {
    switch (blockBytes) {
        case 1:
            return pickBlocks<1>(from, strideBytes, count, to);
        case 2:
            return pickBlocks<2>(from, strideBytes, count, to);
        case 4:
            return pickBlocks<4>(from, strideBytes, count, to);
        case 8:
            return pickBlocks<8>(from, strideBytes, count, to);
        default:
            for (unsigned long i = 0; i < count; ++i)
                std::memcpy(to + i * blockBytes, from + i * strideBytes, blockBytes);
    }
}

// The blocks that lie before the last whole one, as far as the file can tell its size.
unsigned long blocksBeforeLast(fileStream& stream, long position, unsigned long strideBytes) {
    long size = 0;
    if (!stream.getFileSize(size) || size <= position) return 0;
    const unsigned long whole = static_cast<unsigned long>(size - position) / strideBytes;
    return whole == 0 ? 0 : whole - 1;
}

}  // namespace

unsigned long gatherBlocks(OpenFile& file, const Stride& stride, unsigned long blocks,
                           OutputBuffer& buffer) {
    fileStream& stream = *file.stream;
    const off_t start = ftello(file.handle.get());
    if (start < 0 || stride.skip > longestSkipRead ||
        stride.blockElements > constants::transferPieceBytes) {
        return 0;
    }
    const unsigned long blockBytes = stride.elementBytes * stride.blockElements;
    const unsigned long strideBytes = blockBytes + stride.skip;
    const unsigned long atOnce = constants::transferPieceBytes / strideBytes;
    if (atOnce == 0) return 0;
    blocks = std::min(blocks, blocksBeforeLast(stream, start, strideBytes));
    if (blocks == 0) return 0;

    std::size_t room = blocks * stride.blockElements;
    auto* const target = static_cast<char*>(buffer.Allocate(room));
    std::vector<char> span(std::min(blocks, atOnce) * strideBytes);
    unsigned long done = 0;
    unsigned long wanted = 0;
    unsigned long got = 0;
    while (done < blocks && got == wanted * strideBytes) {
        wanted = std::min(blocks - done, atOnce);
        got = stream.GetNElements(wanted * strideBytes, span.data(), 1);
        const unsigned long whole = got / strideBytes;
        pick(span.data(), strideBytes, blockBytes, whole, target + done * blockBytes);
        done += whole;
    }
    buffer.SetLastChunkSize(done * stride.blockElements);
    // A file that has become shorter meanwhile: the plain way goes on behind the last whole block.
    if (done < blocks) stream.setPosition(start + static_cast<long>(done * strideBytes));
    return done;
}

}  // namespace Orvandeil::FileIO::embedded
