#pragma once

namespace Orvandeil::FileIO::detail {

inline constexpr int noDigit = 16;

// The worth of a hexadecimal digit in either case, noDigit for any other code unit.
constexpr int digitValue(char16_t unit) {
    if (unit >= u'0' && unit <= u'9') return unit - u'0';
    const char16_t lower = unit | 0x20;
    if (lower >= u'a' && lower <= u'f') return lower - u'a' + 10;
    return noDigit;
}

constexpr bool isDecimalDigit(char16_t unit) {
    return digitValue(unit) < 10;
}
constexpr bool isHexDigit(char16_t unit) {
    return digitValue(unit) < noDigit;
}

}  // namespace Orvandeil::FileIO::detail
