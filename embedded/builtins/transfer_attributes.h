#pragma once

#include "fileio/attributes/machine_format.h"
#include "fileio/attributes/precision_string.h"
#include "fileio/attributes/size_attribute.h"
#include "fileio/attributes/skip_attribute.h"
#include "fileio/host/arrays.h"

#include <string>

// The arguments of binary transfers, parsed once and validated in the order machine format,
// precision, size, skip. They can be validated before there is a file.
namespace Orvandeil::FileIO::embedded {

struct ReadAttributes {
    // Null arrays stand for everything and for no skip. Raises the first argument's error that is
    // invalid; fields spelled "intN" warn.
    ReadAttributes(const std::string& precisionText, const MachineFormat& format,
                   const vxArray* sizeArray = nullptr, const vxArray* skipArray = nullptr);

    PrecisionString precision;
    SizeAttribute size;
    SkipAttribute skip;
};

struct WriteAttributes {
    // Of a value that is to be written. Besides, a value without plain elements is
    // "KESTRA:UnableToConvert".
    WriteAttributes(const vxArray& value, const std::string& precisionText,
                    const MachineFormat& format, const vxArray* skipArray = nullptr);

    PrecisionString precision;
    SkipAttribute skip;
};

}  // namespace Orvandeil::FileIO::embedded
