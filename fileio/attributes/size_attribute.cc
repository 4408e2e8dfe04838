#include "fileio/attributes/size_attribute.h"

#include "fileio/buffers/element_conversion.h"
#include "fileio/buffers/host_array.h"
#include "fileio/errors/identifiers.h"
#include "fileio/host/messages.h"

#include <array>
#include <cmath>

#include <boost/numeric/conversion/cast.hpp>

namespace Orvandeil::FileIO {
namespace {

constexpr int noConversion = 13;

bool isRealNumeric(const vxArray* array) {
    return detail::isNumericClass(vxArrayClassID(array)) && !vxArrayIsComplex(array);
}

// False for NaN, too.
bool isCount(double value) {
    return value >= 0;
}

// 1 for a scalar, 2 for a row of two, else 0.
int formOf(const vxArray* array) {
    const std::size_t* lengths = vxArrayDimensions(array);
    if (vxArrayDimensionCount(array) != 2 || lengths[0] != 1 || lengths[1] > 2) return 0;
    return static_cast<int>(lengths[1]);
}

unsigned long bytesInElements(double count, unsigned long elementSize) {
    const double quotient = std::ceil(count / static_cast<double>(elementSize));
    try {
        // The cast's own range test lets NaN pass.
        if (!std::isnan(quotient)) return boost::numeric_cast<unsigned long>(quotient);
    } catch (const boost::numeric::bad_numeric_cast&) {
    }
    vxErrMsgId(KESTRA::legacy_two_part::p64bitsize());
}

const KESTRA::legacy_two_part::badsize_vx& defaultError() {
    static const KESTRA::legacy_two_part::badsize_vx error;
    return error;
}

}  // namespace

SizeAttribute::SizeAttribute() : NumericAttr(defaultError()) {}

SizeAttribute::SizeAttribute(const vxArray* array) : SizeAttribute() {
    Init(array);
}

SizeAttribute& SizeAttribute::operator=(const vxArray* array) {
    Init(array);
    return *this;
}

void SizeAttribute::Init(const vxArray* array) {
    *this = SizeAttribute();
    if (!isRealNumeric(array)) {
        SetError(KESTRA::FileIO::sizeMustBeNumeric());
        return;
    }
    isInfinite = false;
    int form = 0;
    if (ParseSize(array, &form) == 0) {
        isMatrix = form == 2;
    } else {
        SetError(KESTRA::legacy_two_part::badsize_vx());
    }
}

int SizeAttribute::ParseSize(const vxArray* array, int* form) {
    *form = formOf(array);
    std::array<double, 2> values{};
    const auto count = static_cast<std::size_t>(*form);
    if (count == 0) return 1;
    AssignToVoidBuffer(vxDOUBLE_CLASS, values.data(), VxData(array), count);
    return count == 1 ? parseScalar(values[0]) : parsePair(values[0], values[1]);
}

int SizeAttribute::parseScalar(double value) {
    if (!isCount(value)) return 1;
    if (value > limit) return accept(1, 0, true);
    return accept(value, value == 0 ? 0 : 1, false);
}

int SizeAttribute::parsePair(double rows, double columns) {
    if (!isCount(rows) || !isCount(columns) || rows > limit) return 1;
    if (columns > limit) return accept(rows, 0, rows != 0);
    if (rows * columns > limit) return 1;
    return accept(rows, columns, false);
}

int SizeAttribute::accept(double rows, double columns, bool endless) {
    m = static_cast<unsigned long>(rows);
    n = static_cast<unsigned long>(columns);
    isInfinite = endless;
    return 0;
}

void SizeAttribute::Adjust(int kind, unsigned long elementSize) {
    if (kind != noConversion) return;
    if (!isInfinite) {
        n = bytesInElements(static_cast<double>(m) * static_cast<double>(n), elementSize);
    }
    m = 1;
}

}  // namespace Orvandeil::FileIO
