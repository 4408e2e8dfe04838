#pragma once

#include "embedded/builtins/open_file.h"
#include "embedded/builtins/transfer_attributes.h"
#include "embedded/services/array.h"

#include <optional>

namespace Orvandeil::FileIO::embedded {

struct ReadResult {
    ArrayPtr array;                  // shaped as the size asks, its last column padded with zeros
    unsigned long count = 0;         // elements read, without the padding
    std::optional<Failure> failure;  // what ended the read early; the end of the file is none
};

// Reads elements from the current position, as many as the size asks for or as there are. A skip
// follows every block but the last. Bits of a bit field that the file's last byte still has are
// kept for the next read of fields. CodeError -5, -31 and -33 when nothing can be read at all.
ReadResult readBinary(OpenFile& file, const ReadAttributes& attributes);

}  // namespace Orvandeil::FileIO::embedded
