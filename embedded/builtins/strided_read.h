#pragma once

#include "embedded/builtins/open_file.h"
#include "fileio/buffers/output_buffer.h"

namespace Orvandeil::FileIO::embedded {

// Blocks of elements with bytes between them that are skipped.
struct Stride {
    unsigned long elementBytes;
    unsigned long blockElements;
    unsigned long skip;
};

// Reads up to `blocks` blocks, each with its skip behind it, in spans of many blocks: a positioning
// for every block is what makes strided reads slow. It takes only what surely lies before the last
// block of the file, and leaves that to the plain way of reading, with all that the end brings.
// Returns the blocks read, maybe 0; the file is then behind the last one's skip.
unsigned long gatherBlocks(OpenFile& file, const Stride& stride, unsigned long blocks,
                           OutputBuffer& buffer);

}  // namespace Orvandeil::FileIO::embedded
