#pragma once

#include "fileio/export.h"
#include "fileio/host/arrays.h"

#include <cstddef>
#include <functional>
#include <initializer_list>
#include <map>
#include <memory>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include <boost/container/small_vector.hpp>

// Arrays of the embedded host, and the makers that its built-ins, the program and tests use.
namespace Orvandeil::FileIO::embedded {

struct ArrayDestroyer {
    void operator()(vxArray* array) const noexcept { vxArrayDestroy(array); }
};
using ArrayPtr = std::unique_ptr<vxArray, ArrayDestroyer>;

using Dimensions = boost::container::small_vector<std::size_t, 2>;
// A text of a string array; no value: missing.
using StringElement = std::optional<std::u16string>;

// A host function of one output. Null: it does not apply to these inputs. It may raise.
using HostFunction = std::function<ArrayPtr(std::span<const vxArray* const> inputs)>;
// Functions by name ("size", "subsref", "double", …).
using FunctionTable = std::map<std::string, HostFunction, std::less<>>;

// Lengths of any number; padded with 1 to two dimensions. Elements are zero.
FILEIO_API ArrayPtr makeNumeric(vxClassID classID, Dimensions dimensions,
                                vxComplexity complexity = vxREAL);
// The same, of real elements that lie in a block of the host's memory, which the array takes over
// unless this raises.
FILEIO_API ArrayPtr makeNumeric(vxClassID classID, Dimensions dimensions, void* block);
// `values` in column-major order, rows × columns of them.
FILEIO_API ArrayPtr makeDoubles(std::size_t rows, std::size_t columns,
                                std::initializer_list<double> values);
FILEIO_API ArrayPtr makeDoubles(std::size_t rows, std::size_t columns,
                                std::span<const double> values);
FILEIO_API ArrayPtr makeScalar(double value);
// One row; 0 by 0 for an empty text.
FILEIO_API ArrayPtr makeChars(std::u16string_view text);
// As many elements as the dimensions ask for, in column-major order.
FILEIO_API ArrayPtr makeStrings(std::vector<StringElement> texts, Dimensions dimensions);
FILEIO_API ArrayPtr makeString(StringElement text);
// An object whose class answers the host's calls by `functions`; nothing else applies to it.
FILEIO_API ArrayPtr makeObject(std::string className, FunctionTable functions,
                               Dimensions dimensions = {1, 1});
// A copy, contents of cells and structs included.
FILEIO_API ArrayPtr copyOf(const vxArray& array);

// The first imaginary part, laid out as the real ones; null in a real array.
FILEIO_API const void* imaginaryData(const vxArray& array);
FILEIO_API void* imaginaryData(vxArray& array);
// The real parts for writing; null for classes without plain elements.
FILEIO_API void* realData(vxArray& array);

FILEIO_API std::size_t elementCount(const vxArray& array);
// Bytes of an element; 0 for classes without plain elements.
FILEIO_API std::size_t elementBytes(vxClassID classID);
// The name that a class without a name of its own has ("double", "char", "cell", …).
FILEIO_API const char* nameOfClass(vxClassID classID);

// The content of a 1 by 1 cell or the field of a 1 by 1 struct; null when there is none.
FILEIO_API const vxArray* cellContent(const vxArray& cell);
FILEIO_API const vxArray* structField(const vxArray& structure, std::string_view name);

// A row of values, whose type must be the element type of the class.
template <class T>
ArrayPtr makeRow(vxClassID classID, std::initializer_list<T> values) {
    ArrayPtr array = makeNumeric(classID, {values.size() == 0 ? 0u : 1u, values.size()});
    T* out = static_cast<T*>(realData(*array));
    for (const T value : values)
        *out++ = value;
    return array;
}

}  // namespace Orvandeil::FileIO::embedded
