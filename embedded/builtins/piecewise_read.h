#pragma once

#include "embedded/builtins/file_element.h"
#include "embedded/builtins/open_file.h"
#include "fileio/buffers/output_buffer.h"
#include "fileio/host/arrays.h"

namespace Orvandeil::FileIO::embedded {

// What a read wants of a file.
struct WantedElements {
    const FileElement& element;
    unsigned long count;
    unsigned long perBlock;  // elements between two skips
    unsigned long skip;      // bytes
    vxClassID collected;     // the class of the elements before they are converted
};

// The fast part of a read. It makes room for all the elements once, as the file tells its size, and
// puts them there in pieces that stay in the processor's cache while they are picked out, swapped
// and converted to the buffer's class. It takes only what surely lies before the end, before the
// last block of a strided read, and leaves the rest to the plain way of reading, with all that the
// end brings; for that the buffer has room as well. Returns the elements read, maybe 0. The file is
// then behind them, and behind the last block's skip.
unsigned long readInPieces(OpenFile& file, const WantedElements& wanted, OutputBuffer& target);

}  // namespace Orvandeil::FileIO::embedded
