#pragma once

#include "fileio/export.h"
#include "fileio/printf/field_validator.h"
#include "fileio/printf/vocabulary.h"

namespace Orvandeil::FileIO {

class printfArgumentSource;

// The width or the precision of a conversion.
class FILEIO_API FormatField {
public:
    FormatField(const FieldValidator& fieldValidator, WidthPrecisionFieldType fieldKind,
                int formatValue)
        : validator(&fieldValidator), kind(fieldKind), value(formatValue), effective(formatValue) {}

    // Takes the value from an argument where the format says so. Throws, as int, the codes of
    // the source and of the validator.
    void setup(printfArgumentSource* source);

    bool isFromArgument() const {
        return kind == FieldNumberedArgument || kind == FieldNextArgument;
    }
    bool isPresent() const { return kind != FieldAbsent; }
    bool isNegative() const { return negative; }
    // The magnitude; 64 bits, because that of the smallest 32-bit value needs them.
    long getEffective() const { return effective; }
    WidthPrecisionFieldType getKind() const { return kind; }
    int getValue() const { return value; }

private:
    friend struct LayoutProbe;

    const FieldValidator* validator;
    WidthPrecisionFieldType kind;
    int value;
    long effective;
    bool negative = false;
};

}  // namespace Orvandeil::FileIO
