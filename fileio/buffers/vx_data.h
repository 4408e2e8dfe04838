#pragma once

#include "fileio/export.h"
#include "fileio/host/arrays.h"
#include "fileio/memory_operation_overloads.h"

#include <cstddef>
#include <string>

namespace Orvandeil::FileIO {

// Typed access to the elements of a host array, which it does not own. Class and data are asked
// for once, so that walking an array calls the host no more.
class FILEIO_API VxData : public fiMemoryOperationOverloads {
public:
    explicit VxData(const vxArray* hostArray);

    const vxArray* getArray() const { return array; }
    vxClassID getClassID() const { return classID; }
    // The first element's real part; null for objects and other classes without plain elements.
    const void* getElements() const { return elements; }
    bool isObject() const { return classID == vxOBJECT_CLASS; }

    // Element `index` (column-major, from 0; the real part) as T: double, float, long, unsigned
    // long, char16_t by the conversion rules, or std::u16string.
    //
    // An object's element is fetched with the host function "subsref" and converted by the host
    // function named after the target class ("double", "single", "int64", "uint64", "char").
    // Raises "KESTRA:UnableToConvert" when that does not give the class asked for, and
    // "KESTRA:printf:UnableToConvertToOneElement" when it gives more than one element. The text of
    // an object comes from a string array's element, or from "char", or from "string"; a missing
    // string raises "KESTRA:string:MissingNotSupported", a "string" result that is not 1 by 1
    // "KESTRA:string:MustBeStringScalarOrCharacterVector".
    template <class T>
    T getIndexAs(std::size_t index) const;

    // The first `count` elements as UTF-16 code units.
    void copyIntoChar(char16_t* out, std::size_t count) const;

private:
    const vxArray* array;
    vxClassID classID;
    const void* elements;
};

template <>
FILEIO_API std::u16string VxData::getIndexAs<std::u16string>(std::size_t index) const;
extern template FILEIO_API double VxData::getIndexAs<double>(std::size_t) const;
extern template FILEIO_API float VxData::getIndexAs<float>(std::size_t) const;
extern template FILEIO_API long VxData::getIndexAs<long>(std::size_t) const;
extern template FILEIO_API unsigned long VxData::getIndexAs<unsigned long>(std::size_t) const;
extern template FILEIO_API char16_t VxData::getIndexAs<char16_t>(std::size_t) const;

}  // namespace Orvandeil::FileIO
