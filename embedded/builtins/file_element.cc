#include "embedded/builtins/file_element.h"

#include "fileio/buffers/element_conversion.h"
#include "fileio/host/data_sizes.h"

#include <string_view>

namespace Orvandeil::FileIO::embedded {
namespace {

// "char" is text, "char*1" a byte; both have the same code.
bool isByteCharacter(const PrecisionString& precision) {
    const std::string_view text = precision.text;
    return text.substr(0, text.find('=')).ends_with("char*1");
}

FileElement fieldElement(const PrecisionString& precision, vxClassID container,
                         unsigned long bytes) {
    constexpr int bigEndian = 1;
    const int stride = precision.convertedSize != 0 ? precision.convertedSize : precision.bitCount;
    const bool isBig = vxDataSizeEndian(precision.machineFormat) == bigEndian;
    return {FileElement::Field, container, bytes, {precision.bitCount, stride, isBig}, false};
}

}  // namespace

FileElement elementInFile(const PrecisionString& precision, int type) {
    const auto typeCode = static_cast<std::size_t>(type);
    const vxClassID classID = fiPkGetClassIDFromType(typeCode);
    const unsigned long bytes = fiPkGetSizeFromType(typeCode);
    if (precision.bitCount != 0) return fieldElement(precision, classID, bytes);
    if (type != dataType::Char) {
        return {FileElement::Plain,
                classID,
                bytes,
                {},
                bytes > 1 && fiNeedsByteFlip(classID, precision.machineFormat)};
    }
    if (isByteCharacter(precision)) return {FileElement::Plain, vxUINT8_CLASS, 1, {}, false};
    return {FileElement::Text, vxCHAR_CLASS, 1, {}, false};
}

void beginElements(OpenFile& file, Direction direction, const FileElement& element,
                   int machineFormat) {
    if (element.form == FileElement::Field) {
        beginBitTransfer(file, direction, machineFormat);
    } else {
        beginTransfer(file, direction);
    }
}

}  // namespace Orvandeil::FileIO::embedded
