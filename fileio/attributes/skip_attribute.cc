#include "fileio/attributes/skip_attribute.h"

#include "fileio/errors/identifiers.h"

namespace Orvandeil::FileIO {

SkipAttribute::SkipAttribute() : NumericAttr(KESTRA::legacy_two_part::badskip_vx()) {}

SkipAttribute::SkipAttribute(const vxArray* array) : SkipAttribute() {
    Init(array);
}

SkipAttribute& SkipAttribute::operator=(const vxArray* array) {
    Init(array);
    return *this;
}

void SkipAttribute::Init(const vxArray* array) {
    *this = SkipAttribute();
    valid = GetInt64(array, skip, nullptr, nullptr) && skip >= 0;
}

}  // namespace Orvandeil::FileIO
