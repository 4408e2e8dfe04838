#pragma once

#include "fileio/attributes/char_attr_validator.h"
#include "fileio/attributes/data_type.h"
#include "fileio/host/data_sizes.h"

namespace Orvandeil::FileIO {

// How a binary transfer takes its elements: "[N*]source[=>target]" or "*source", where a type is a
// name ("uint8", "double", "char", ...) or a bit field: "bitN" and "intN" are signed, "ubitN" and
// "uintN" unsigned, and "...NinM" is a field of N bits in the first of every M bits. "source" alone
// delivers double, "*source" what the file holds. For writing, a single type alone: the file's.
class FILEIO_API PrecisionString
    : public CharAttrValidator<&dfltPrecVal, KESTRA::legacy_two_part::badprecision_vx> {
public:
    // Reading: unsigned bytes into double.
    PrecisionString();
    // Writing of elements with data-type code `type`: into unsigned bytes, no "=>" accepted.
    explicit PrecisionString(int type);
    explicit PrecisionString(const char* precision);
    PrecisionString(const PrecisionString&) = default;
    // Takes over the type, not the text that described it: `text` and `valid` stay, on purpose.
    PrecisionString& operator=(const PrecisionString& other);
    PrecisionString& operator=(const char* precision);

    // Parses for `machineFormat`, which the caller sets before. May warn, as the parser below.
    bool Init(const char* precision) override;

    int outputType = dataType::Double;       // delivered; when writing, the file's
    int machineFormat = vxDataSizeNative();  // moved to its 64-bit-long variant by wide types
    unsigned long repeatCount = 1;           // elements in a block
    int convertedSize = 0;                   // bytes in the file of a foreign format, 0 if native;
                                             // of a field "NinM" its M bits
    int inputType = dataType::UInt8;         // the file's; when writing, the values'
    int bitCount = 0;                        // bits of a field; 0 when the type is no field
    bool allowConversion = true;             // whether "=>" is accepted

private:
    bool initFileType(const char* rest);
    bool initSource(const char* rest, bool shorthand);
    bool initTarget(const char* rest);
};

// Recognises the type that `text` begins with, up to its end or a '='. Returns the place behind it
// and stores data-type code, bits (0: no field) and size (as in PrecisionString); or returns null
// and stores nothing. The names "int64" and "uint64", and fields of more than 32 bits, move
// `machineFormat` to the variant of its byte order with 64-bit longs. Fields written "intN" and
// "uintN" warn: "KESTRA:FileIO:InvalidIntPrecision", "KESTRA:FileIO:InvalidUIntPrecision".
FILEIO_API const char* fiPvParsePrecisionType(const char* text, int* machineFormat, int* type,
                                              int* bitCount, int* size);

}  // namespace Orvandeil::FileIO
