#pragma once

#include "fileio/export.h"

#include <cstddef>

// Arrays of the host. The library never looks inside one: it asks for shape, class and data once
// and then walks the data itself. Elements are stored in column-major order. Real parts stand
// contiguously on their own; where imaginary parts are kept is the host's affair.

struct vxArray;

// The class of an array's elements, with the numbers that hosts use. 5 and 16 are not in use.
enum vxClassID : int {
    vxUNKNOWN_CLASS = 0,
    vxCELL_CLASS = 1,
    vxSTRUCT_CLASS = 2,
    vxLOGICAL_CLASS = 3,  // 1 byte, 0 or 1
    vxCHAR_CLASS = 4,     // 2 bytes, a UTF-16 code unit
    vxDOUBLE_CLASS = 6,   // IEEE 754 binary64
    vxSINGLE_CLASS = 7,   // IEEE 754 binary32
    vxINT8_CLASS = 8,
    vxUINT8_CLASS = 9,
    vxINT16_CLASS = 10,
    vxUINT16_CLASS = 11,
    vxINT32_CLASS = 12,
    vxUINT32_CLASS = 13,
    vxINT64_CLASS = 14,
    vxUINT64_CLASS = 15,
    vxOBJECT_CLASS = 17  // anything with a class of its own, string arrays included
};

enum vxComplexity : int { vxREAL = 0, vxCOMPLEX = 1 };

// A new zero-filled array of a numeric class, char or logical. The caller owns it.
FILEIO_API vxArray* vxCreateNumericMatrix(std::size_t rows, std::size_t columns, vxClassID classID,
                                          vxComplexity complexity);

// A new 1 by 1 double array. The caller owns it.
FILEIO_API vxArray* vxCreateDoubleScalar(double value);

// A new 1 by `length` char array (0 by 0 when `length` is 0). The caller owns it.
FILEIO_API vxArray* vxCreateCharRow(const char16_t* text, std::size_t length);

// A new 1 by 1 cell array that takes over `content`, unless it raises. The caller owns it.
FILEIO_API vxArray* vxCreateCellScalar(vxArray* content);

// A new 1 by 1 struct array with `count` fields in the order given. It takes over the values,
// unless it raises. The caller owns it.
FILEIO_API vxArray* vxCreateStructScalar(std::size_t count, const char* const* names,
                                         vxArray* const* values);

// Ends an array's life; null is allowed.
FILEIO_API void vxArrayDestroy(vxArray* array) noexcept;

// The two dimensions of a two-dimensional array, without touching its data. The data block has to
// be given to fit.
FILEIO_API void vxArraySetRows(vxArray* array, std::size_t rows);
FILEIO_API void vxArraySetColumns(vxArray* array, std::size_t columns);

// Makes `block`, taken from the host's allocator, the array's real data. The array owns it from
// now on and frees what it held before. Null stands for no data.
FILEIO_API void vxArraySetData(vxArray* array, void* block);

// Tells the host that this double array holds exactly one element. A host without a special form
// for scalars does nothing.
FILEIO_API void vxArrayMarkScalar(vxArray* array);

FILEIO_API vxClassID vxArrayClassID(const vxArray* array);

// The name of the array's class ("double", "char", "string", an object's own), NUL-terminated. It
// lives as long as the array.
FILEIO_API const char* vxArrayClassName(const vxArray* array);

// The number of dimensions (2 or more), and that many lengths; they live until the shape changes.
FILEIO_API std::size_t vxArrayDimensionCount(const vxArray* array);
FILEIO_API const std::size_t* vxArrayDimensions(const vxArray* array);

// The first real part of a numeric, char or logical array; null for other classes, and allowed to
// be null for an empty array.
FILEIO_API const void* vxArrayData(const vxArray* array);

// Whether imaginary parts are present.
FILEIO_API bool vxArrayIsComplex(const vxArray* array);

// Two-dimensional with one row or one column.
FILEIO_API bool vxArrayIsVector(const vxArray* array);

// Exactly one element.
FILEIO_API bool vxArrayIsScalar(const vxArray* array);

// The real part of the first element of a non-empty numeric, char or logical array.
FILEIO_API double vxArrayFirstAsDouble(const vxArray* array);
