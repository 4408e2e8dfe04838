#pragma once

#include "embedded/builtins/bit_fields.h"
#include "embedded/builtins/open_file.h"
#include "fileio/buffers/output_buffer.h"

#include <cstddef>
#include <vector>

// Runs of bit fields in files. A run begins in the file's carry byte and ends in it; the transfer
// has begun (beginBitTransfer).
namespace Orvandeil::FileIO::embedded {

// The bytes of a run of fields, the carry byte first and room for the last field's reach behind.
struct FieldRun {
    FieldRun(const FieldLayout& fieldLayout, unsigned long count);

    unsigned long stride() const { return static_cast<unsigned long>(layout.stride); }

    FieldLayout layout;
    unsigned long fieldsAtOnce;  // `count` at most
    std::vector<unsigned char> bytes;
};

// Reads fields in two steps, so that their number is known before there has to be room for them.
class FieldReader {
public:
    // Of up to `atOnce` fields at a time.
    FieldReader(OpenFile& source, const FieldLayout& layout, unsigned long atOnce)
        : file(source), run(layout, atOnce) {}

    unsigned long fieldsAtOnce() const { return run.fieldsAtOnce; }

    // Reads `count` fields and tells how many there were.
    unsigned long fetch(unsigned long count);
    // Puts the fields just read into a block of elements of an integer class.
    void unpack(vxClassID classID, void* target) const;

private:
    OpenFile& file;
    FieldRun run;
    unsigned long fetched = 0;
    std::size_t start = 0;  // the bit where the first of them begins
};

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
