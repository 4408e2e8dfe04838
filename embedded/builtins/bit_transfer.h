#pragma once

#include "embedded/builtins/bit_fields.h"
#include "embedded/builtins/open_file.h"
#include "fileio/buffers/output_buffer.h"

#include <cstddef>

// Runs of bit fields in files. A run begins in the file's carry byte and ends in it; the transfer
// has begun (beginBitTransfer).
namespace Orvandeil::FileIO::embedded {

// Reads up to `count` fields into a buffer of an integer class, and not a byte too many. Returns
// the fields read; fewer at the end of the data, where the bits of an incomplete field are dropped.
unsigned long readFields(OpenFile& file, const FieldLayout& layout, unsigned long count,
                         OutputBuffer& buffer);

// Writes `count` elements of an integer class as fields; values out of a field's range saturate.
// Whole bytes go out, the rest stays pending. Returns the fields that went out or are pending.
unsigned long writeFields(OpenFile& file, const FieldLayout& layout, unsigned long count,
                          vxClassID classID, const void* values);

// Before a skip: bits left from a read are dropped, those of a write settled, so that the bytes
// skipped begin at the next whole one. False when they cannot be settled.
bool alignFields(OpenFile& file);

}  // namespace Orvandeil::FileIO::embedded
