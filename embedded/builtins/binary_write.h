#pragma once

#include "embedded/builtins/open_file.h"
#include "embedded/builtins/transfer_attributes.h"
#include "fileio/host/arrays.h"

#include <optional>

namespace Orvandeil::FileIO::embedded {

struct WriteResult {
    unsigned long count = 0;         // elements written, those whose last bits are pending included
    unsigned long bytes = 0;         // that went out for them, without pending bits
    std::optional<Failure> failure;  // code 0 when nothing tells the cause
};

// Writes the elements of an array (real parts) in column-major order, converted to the type that
// its attributes name. A skip follows every block but the last. CodeError -3, -31 and -33 when
// nothing can be written at all.
WriteResult writeBinary(OpenFile& file, const vxArray& value, const WriteAttributes& attributes);

}  // namespace Orvandeil::FileIO::embedded
