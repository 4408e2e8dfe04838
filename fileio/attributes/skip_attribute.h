#pragma once

#include "fileio/attributes/numeric_attr.h"

namespace Orvandeil::FileIO {

// The bytes skipped between the blocks of a binary transfer: a whole number, not negative.
class FILEIO_API SkipAttribute : public NumericAttr {
public:
    SkipAttribute();
    explicit SkipAttribute(const vxArray* array);
    SkipAttribute& operator=(const vxArray* array);

    // Starts afresh; anything but a count keeps "KESTRA:legacy_two_part:badskip_vx".
    void Init(const vxArray* array);

    long skip = 0;
};

}  // namespace Orvandeil::FileIO
