#pragma once

#include "fileio/host/arrays.h"

#include <cstddef>
#include <string>

// Calls back into the host's own functions, and its string arrays.

// Calls the host function `name` ("size", "subsref", "double", "single", "char", "string",
// "int64", "uint64") on the inputs, for one output. The caller owns the result. Null: no such
// function applies to these inputs. An error inside the function passes on as the exception that
// the host raises.
FILEIO_API vxArray* vxDispatchCall(const char* name, const vxArray* const* inputs,
                                   std::size_t count);

// Whether the array is a string array: each element a whole text, or missing.
FILEIO_API bool vxStringArrayIs(const vxArray* array);

// Whether element `index` (column-major, from 0) of a string array is missing.
FILEIO_API bool vxStringArrayIsMissing(const vxArray* array, std::size_t index);

// The text of element `index` (column-major, from 0) of a string array, not missing.
FILEIO_API std::u16string vxStringArrayText(const vxArray* array, std::size_t index);
