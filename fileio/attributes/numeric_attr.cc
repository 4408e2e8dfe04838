#include "fileio/attributes/numeric_attr.h"

#include "fileio/buffers/host_array.h"
#include "fileio/buffers/vx_data.h"
#include "fileio/host/messages.h"

#include <cmath>
#include <limits>
#include <utility>

namespace Orvandeil::FileIO {
namespace {

void tell(bool* place, bool value) {
    if (place != nullptr) *place = value;
}

// 2^63: no signed 64-bit integer, while its cast would saturate to one that compares equal to it.
constexpr double beyondLong = 0x1p63;

long truncate(double d) {
    if (std::isinf(d)) return d > 0 ? 1 : -1;
    return d >= -beyondLong && d < beyondLong ? static_cast<long>(d) : 0;
}

}  // namespace

NumericAttr::~NumericAttr() = default;

bool NumericAttr::IsValid() const {
    return valid;
}

void NumericAttr::Validate() const {
    if (!IsValid()) vxErrorRethrow(error);
}

bool NumericAttr::GetInt64(double d, long& out, bool* isNaN, bool* isInf) {
    tell(isNaN, std::isnan(d));
    tell(isInf, std::isinf(d));
    out = truncate(d);
    return d >= -beyondLong && d < beyondLong && static_cast<double>(out) == d;
}

bool NumericAttr::GetInt64(const vxArray* array, long& out, bool* isNaN, bool* isInf) {
    tell(isNaN, false);
    tell(isInf, false);
    const VxData data(array);
    if (!detail::isNumericClass(data.getClassID()) || detail::elementCount(array) == 0)
        return false;
    switch (data.getClassID()) {
        case vxDOUBLE_CLASS:
        case vxSINGLE_CLASS:
            return GetInt64(data.getIndexAs<double>(0), out, isNaN, isInf);
        case vxUINT64_CLASS:
            out = data.getIndexAs<long>(0);
            return std::in_range<long>(data.getIndexAs<unsigned long>(0));
        default:
            out = data.getIndexAs<long>(0);
            return true;
    }
}

int NumericAttr::ReplaceOutOfRange(double d, int replacement) {
    using Limits = std::numeric_limits<int>;
    if (std::isnan(d) || d > Limits::max()) return replacement;
    return d < Limits::min() ? Limits::min() : static_cast<int>(d);
}

}  // namespace Orvandeil::FileIO
