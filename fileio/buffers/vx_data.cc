#include "fileio/buffers/vx_data.h"

#include "fileio/buffers/convert_element.h"
#include "fileio/buffers/element_conversion.h"
#include "fileio/buffers/host_array.h"
#include "fileio/errors/identifiers.h"
#include "fileio/host/dispatch.h"
#include "fileio/host/messages.h"

#include <array>

namespace Orvandeil::FileIO {
namespace {

using detail::OwnedArray;

// Class and host conversion function of each type that an object's element is asked for as. The
// function is named after the class.
template <class T>
struct ObjectTarget;
template <>
struct ObjectTarget<double> {
    static constexpr vxClassID classID = vxDOUBLE_CLASS;
    static constexpr const char* name = "double";
};
template <>
struct ObjectTarget<float> {
    static constexpr vxClassID classID = vxSINGLE_CLASS;
    static constexpr const char* name = "single";
};
template <>
struct ObjectTarget<long> {
    static constexpr vxClassID classID = vxINT64_CLASS;
    static constexpr const char* name = "int64";
};
template <>
struct ObjectTarget<unsigned long> {
    static constexpr vxClassID classID = vxUINT64_CLASS;
    static constexpr const char* name = "uint64";
};
template <>
struct ObjectTarget<char16_t> {
    static constexpr vxClassID classID = vxCHAR_CLASS;
    static constexpr const char* name = "char";
};

// The structure that "subsref" takes for the parentheses in A(index + 1).
OwnedArray makeSubscript(std::size_t index) {
    OwnedArray type(vxCreateCharRow(u"()", 2));
    OwnedArray position(vxCreateDoubleScalar(static_cast<double>(index) + 1));
    OwnedArray subscripts(vxCreateCellScalar(position.get()));
    static_cast<void>(position.release());
    constexpr std::array<const char*, 2> names = {"type", "subs"};
    const std::array<vxArray*, 2> values = {type.get(), subscripts.get()};
    OwnedArray structure(vxCreateStructScalar(names.size(), names.data(), values.data()));
    static_cast<void>(type.release());
    static_cast<void>(subscripts.release());
    return structure;
}

// Null when the host has no such element.
OwnedArray fetchElement(const vxArray* object, std::size_t index) {
    const OwnedArray subscript = makeSubscript(index);
    const std::array<const vxArray*, 2> inputs = {object, subscript.get()};
    return OwnedArray(vxDispatchCall("subsref", inputs.data(), inputs.size()));
}

// Null when there is no element or the conversion does not apply to it.
OwnedArray callConversion(const char* name, const OwnedArray& element) {
    if (!element) return nullptr;
    const vxArray* input = element.get();
    return OwnedArray(vxDispatchCall(name, &input, 1));
}

template <class T>
T readObjectElement(const vxArray* object, std::size_t index) {
    using Target = ObjectTarget<T>;
    const OwnedArray value = callConversion(Target::name, fetchElement(object, index));
    if (!value || vxArrayClassID(value.get()) != Target::classID) {
        namespace conversion = KESTRA::catalog_class;
        vxErrMsgId(conversion::raisedAs,
                   conversion::key_UnableToConvert(vxArrayClassName(object), Target::name));
    }
    if (!vxArrayIsScalar(value.get())) {
        vxErrMsgId(
            KESTRA::printf::UnableToConvertToOneElement(vxArrayClassName(object), Target::name));
    }
    return detail::loadElement<T>(vxArrayData(value.get()), 0);
}

std::u16string readStringElement(const vxArray* stringArray, std::size_t index) {
    if (vxStringArrayIsMissing(stringArray, index)) {
        vxErrMsgId(KESTRA::string::MissingNotSupported());
    }
    return vxStringArrayText(stringArray, index);
}

bool isCharacterVector(const vxArray* array) {
    return vxArrayClassID(array) == vxCHAR_CLASS &&
           (vxArrayIsVector(array) || detail::elementCount(array) == 0);
}

std::u16string textOfCharacters(const vxArray* characters) {
    std::u16string text(detail::elementCount(characters), u'\0');
    VxData(characters).copyIntoChar(text.data(), text.size());
    return text;
}

bool isOneByOne(const vxArray* array) {
    const std::size_t* lengths = vxArrayDimensions(array);
    return vxArrayDimensionCount(array) == 2 && lengths[0] == 1 && lengths[1] == 1;
}

std::u16string readObjectText(const vxArray* object, std::size_t index) {
    if (vxStringArrayIs(object)) return readStringElement(object, index);
    const OwnedArray element = fetchElement(object, index);
    const OwnedArray characters = callConversion("char", element);
    if (characters && isCharacterVector(characters.get())) {
        return textOfCharacters(characters.get());
    }
    const OwnedArray string = callConversion("string", element);
    if (!string || !vxStringArrayIs(string.get())) {
        namespace conversion = KESTRA::catalog_class;
        vxErrMsgId(conversion::raisedAs,
                   conversion::key_UnableToConvert2(vxArrayClassName(object), "char", "string"));
    }
    if (!isOneByOne(string.get())) {
        vxErrMsgId(KESTRA::string::MustBeStringScalarOrCharacterVector());
    }
    return readStringElement(string.get(), 0);
}

}  // namespace

VxData::VxData(const vxArray* hostArray)
    : array(hostArray), classID(vxArrayClassID(hostArray)), elements(vxArrayData(hostArray)) {}

// Arrays of other classes than objects that have no plain elements take the objects' way, so that
// the host's conversions decide about them too.
template <class T>
T VxData::getIndexAs(std::size_t index) const {
    T value;
    if (detail::readElement(classID, elements, index, value)) return value;
    return readObjectElement<T>(array, index);
}

template <>
std::u16string VxData::getIndexAs<std::u16string>(std::size_t index) const {
    char16_t unit;
    if (detail::readElement(classID, elements, index, unit)) return std::u16string(1, unit);
    return readObjectText(array, index);
}

template FILEIO_API double VxData::getIndexAs<double>(std::size_t) const;
template FILEIO_API float VxData::getIndexAs<float>(std::size_t) const;
template FILEIO_API long VxData::getIndexAs<long>(std::size_t) const;
template FILEIO_API unsigned long VxData::getIndexAs<unsigned long>(std::size_t) const;
template FILEIO_API char16_t VxData::getIndexAs<char16_t>(std::size_t) const;

void VxData::copyIntoChar(char16_t* out, std::size_t count) const {
    if (AssignToVoidBuffer(vxCHAR_CLASS, out, *this, count) != nullptr) return;
    for (std::size_t i = 0; i < count; ++i) {
        out[i] = getIndexAs<char16_t>(i);
    }
}

}  // namespace Orvandeil::FileIO
