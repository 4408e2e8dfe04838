#pragma once

#include "fileio/export.h"

// Machine formats: the byte orders and integer layouts that a binary file may have. A format is an
// index into the host's table. The last index stands for "no valid format". Two formats whose
// indices leave the same remainder by 5 have the same byte order.

// The index of the machine's own format.
FILEIO_API int vxDataSizeNative();

// The number of entries, the invalid last one included.
FILEIO_API int vxDataSizeCount();

// The long name of format `index`, NUL-terminated and permanent, or null when it has none.
FILEIO_API const char* vxDataSizeName(int index);

// The byte order of format `index`: 1 is big-endian, 0 little-endian.
FILEIO_API int vxDataSizeEndian(int index);

// The bytes that an element of data-type code `type` (1 to 12) takes in format `index`.
FILEIO_API int vxDataSizeConverted(int index, int type);
