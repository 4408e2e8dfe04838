#pragma once

#include "embedded/services/array.h"
#include "fileio/host/arrays.h"

#include <cstddef>
#include <string>
#include <string_view>

// The header of a NumPy file: a Python dictionary of exactly the keys 'descr' (the element type),
// 'fortran_order' and 'shape' (numpy.lib.format, versions 1.0 to 3.0).
namespace Orvandeil::FileIO::embedded {

// An element type of NumPy and the class that holds it.
struct NpyType {
    std::string_view code;  // kind and bytes: "f8"
    vxClassID classID;
    vxComplexity complexity;
};

struct NpyHeader {
    const NpyType* type = nullptr;
    bool isBigEndian = false;
    bool isFortranOrder = false;
    Dimensions shape;  // empty for a scalar
};

// The limit that NumPy itself has.
inline constexpr std::size_t maxNpyDimensions = 64;

// The type for an array of that class, or null when NumPy has none that would read back. Char data
// are code units, "u2".
const NpyType* findNpyType(vxClassID classID, vxComplexity complexity);

// Bytes of one element in a file, imaginary part included.
std::size_t npyElementBytes(const NpyType& type);

// The number of elements. The shape is one that parseNpyHeader or an array gave.
std::size_t npyElementCount(const Dimensions& shape);

// Parses the dictionary in `text`. `file` is named in errors: "KESTRA:npy:badHeader" for text that
// is no such dictionary and for a shape too large to address, "KESTRA:npy:unsupportedType" for
// element types that no class holds (text, half floats, records, dates, objects).
NpyHeader parseNpyHeader(std::string_view text, const std::string& file);

// The whole beginning of a version 1.0 file, padded to a multiple of 64 bytes, for little-endian
// data. `shape` has at most maxNpyDimensions lengths.
std::string formatNpyHeader(const NpyHeader& header);

}  // namespace Orvandeil::FileIO::embedded
