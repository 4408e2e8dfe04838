#include "embedded/builtins/transfer_attributes.h"

#include "fileio/buffers/element_conversion.h"
#include "fileio/errors/identifiers.h"
#include "fileio/host/messages.h"

namespace Orvandeil::FileIO::embedded {
namespace {

constexpr int noType = 0;

void parse(PrecisionString& precision, const std::string& text, const MachineFormat& format) {
    format.Validate();
    // The parser looks at the format, and may move it to its variant with 64-bit longs.
    precision.machineFormat = format.dataSizeType;
    precision = text.c_str();
    precision.Validate();
}

// The data-type code of a class; noType for a class without plain elements.
int typeOfClass(vxClassID classID) {
    for (int type = dataType::Logical; type <= dataType::Double; ++type) {
        if (fiPkGetClassIDFromType(static_cast<std::size_t>(type)) == classID) return type;
    }
    return noType;
}

int writableType(const vxArray& value, const std::string& precisionText) {
    const int type = typeOfClass(vxArrayClassID(&value));
    if (type != noType) return type;
    vxErrMsgId(KESTRA::catalog_class::raisedAs,
               KESTRA::catalog_class::key_UnableToConvert(vxArrayClassName(&value),
                                                          precisionText.c_str()));
}

}  // namespace

ReadAttributes::ReadAttributes(const std::string& precisionText, const MachineFormat& format,
                               const vxArray* sizeArray, const vxArray* skipArray) {
    parse(precision, precisionText, format);
    if (sizeArray != nullptr) size = sizeArray;
    size.Validate();
    if (skipArray != nullptr) skip = skipArray;
    skip.Validate();
}

WriteAttributes::WriteAttributes(const vxArray& value, const std::string& precisionText,
                                 const MachineFormat& format, const vxArray* skipArray)
    : precision(writableType(value, precisionText)) {
    parse(precision, precisionText, format);
    if (skipArray != nullptr) skip = skipArray;
    skip.Validate();
    // Without a conversion the file takes the values' own type.
    if (precision.outputType == dataType::NoConversion) precision.outputType = precision.inputType;
}

}  // namespace Orvandeil::FileIO::embedded
