#pragma once

#include "embedded/builtins/bit_fields.h"
#include "embedded/builtins/open_file.h"
#include "fileio/attributes/precision_string.h"
#include "fileio/host/arrays.h"

namespace Orvandeil::FileIO::embedded {

// What the elements of a precision are in the file.
struct FileElement {
    enum Form {
        Plain,  // a whole number of bytes each
        Field,  // bits
        Text    // characters in the encoding of the stream
    };

    Form form;
    vxClassID classID;    // of the elements in memory, as they come from the file or go there
    unsigned long bytes;  // of a plain one in the file; of the others, of what holds one
    FieldLayout field;
    bool needsFlip;  // whether plain ones have the other byte order
};

// `type` is the data-type code of the file's side.
FileElement elementInFile(const PrecisionString& precision, int type);

// beginTransfer or beginBitTransfer, as the elements need it.
void beginElements(OpenFile& file, Direction direction, const FileElement& element,
                   int machineFormat);

}  // namespace Orvandeil::FileIO::embedded
