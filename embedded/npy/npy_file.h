#pragma once

#include "embedded/services/array.h"

#include <string>

// Arrays in NumPy files. Errors name the file: "KESTRA:npy:cannotRead" and "KESTRA:npy:cannotWrite"
// with the system's text, "KESTRA:npy:badHeader", "KESTRA:npy:unsupportedType",
// "KESTRA:npy:unsupportedClass", "KESTRA:npy:truncated". An array too large for the memory is the
// allocator's error.
namespace Orvandeil::FileIO::embedded {

// The array in a file of version 1.0, 2.0 or 3.0, in either order in memory and either byte order.
// Bools become logical (any byte but 0 is true), complex numbers complex single or double, other
// numbers their own class. A scalar is 1 by 1 and a vector of N elements N by 1. What follows the
// array in the file is left alone. The file may be a pipe; memory grows with the data that are
// really there.
ArrayPtr npyRead(const std::string& file);

// Writes a version 1.0 file, little-endian, in Fortran order, with a header of a multiple of 64
// bytes. Char data are written as their code units, "u2". An existing file is replaced.
void npyWrite(const std::string& file, const vxArray& array);

}  // namespace Orvandeil::FileIO::embedded
