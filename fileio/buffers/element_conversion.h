#pragma once

#include "fileio/buffers/vx_data.h"
#include "fileio/export.h"
#include "fileio/host/arrays.h"

#include <cstddef>

namespace Orvandeil::FileIO {

// Data-type codes of precisions, 1 to 12, each with a class and an element size; 13 stands for "no
// conversion" and has neither.

// Bytes per element of a class; 1 for a class without fixed elements (cell, struct, objects).
FILEIO_API std::size_t fiPkGetSizeFromClassID(vxClassID classID);
// Bytes per element of a data-type code; 0 for an unknown code.
FILEIO_API std::size_t fiPkGetSizeFromType(std::size_t typeCode);
// Class of a data-type code; vxUNKNOWN_CLASS for an unknown code.
FILEIO_API vxClassID fiPkGetClassIDFromType(std::size_t typeCode);

// Whether elements of the class must be byte-swapped between the machine and a file of that
// machine format. Characters never are.
FILEIO_API bool fiNeedsByteFlip(vxClassID classID, int machineFormat);

// A new zero-filled matrix; 0 by 0 as soon as one of the lengths is 0. The caller owns it.
FILEIO_API vxArray* fiPkCreateNumericMatrix(std::size_t m, std::size_t n, vxClassID classID,
                                            vxComplexity complexity);

// The first element of a non-empty double array, else `fallback`.
FILEIO_API double fiPkScalar2Real(const vxArray* array, double fallback);

// A new 1 by strlen(text) double array of the bytes as unsigned values; 0 by 0 for an empty text.
FILEIO_API vxArray* fiPkString2DoubleRowMatrix(const char* text);

// Converts `count` elements at `source` into `target`, which has room for them and does not
// overlap. The one rule set for every pair of classes:
//   the same class: a plain copy, NaN payloads included;
//   to an integer class, char (16 bits unsigned) or logical (0 or 1): NaN gives 0, halves round
//   away from zero, values out of range go to the nearest end;
//   to single or double: the nearest value (IEEE 754, one rounding).
// Returns the place behind the last element written, or null (nothing written) when a class is
// not numeric, char or logical. Neither block need be aligned.
FILEIO_API void* AssignToVoidBuffer(vxClassID targetClass, void* target, vxClassID sourceClass,
                                    const void* source, std::size_t count);

// The same from the first `count` elements of a host array, real parts only.
FILEIO_API void* AssignToVoidBuffer(vxClassID targetClass, void* target, const VxData& source,
                                    std::size_t count);

}  // namespace Orvandeil::FileIO
