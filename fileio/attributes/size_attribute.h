#pragma once

#include "fileio/attributes/numeric_attr.h"

namespace Orvandeil::FileIO {

// How many elements a read takes, and the shape of its result.
class FILEIO_API SizeAttribute : public NumericAttr {
public:
    // The largest count, and the largest product of a shape; anything above it is infinite.
    static constexpr double limit = 281474976710655.0;  // 2^48 - 1

    // Reads everything into a column.
    SizeAttribute();
    explicit SizeAttribute(const vxArray* array);
    SizeAttribute& operator=(const vxArray* array);

    // Starts afresh from the defaults. An array that is no real numeric one keeps
    // "KESTRA:FileIO:sizeMustBeNumeric", any other that is no size keeps
    // "KESTRA:legacy_two_part:badsize_vx".
    void Init(const vxArray* array);

    // `array` is real and numeric. 0 on success, 1 on failure; `form` tells how the size was
    // written: 1 a scalar, 2 a pair, 0 an empty array or another shape.
    int ParseSize(const vxArray* array, int* form);

    // For kind 13 (a transfer without conversion) the size becomes a count of bytes in one row.
    // An infinite size stays infinite. Raises "KESTRA:legacy_two_part:p64bitsize", and changes
    // nothing, when the count does not fit 64 bits or `elementSize` is 0. Other kinds change
    // nothing.
    void Adjust(int kind, unsigned long elementSize);

    unsigned long m = 1;
    unsigned long n = 0;
    bool isMatrix = false;   // written as a pair
    bool isInfinite = true;  // to the end of the data

private:
    int parseScalar(double value);
    int parsePair(double rows, double columns);
    int accept(double rows, double columns, bool endless);
};

}  // namespace Orvandeil::FileIO
