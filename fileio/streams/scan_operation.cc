#include "fileio/streams/scan_operation.h"

#include <charconv>

namespace Orvandeil::FileIO::detail {
namespace {

bool isHexDigit(char c) {
    return (c >= '0' && c <= '9') || (c >= 'a' && c <= 'f') || (c >= 'A' && c <= 'F');
}

// A prefix only counts with a digit behind it: else the zero alone is the number.
bool hasHexPrefix(std::string_view digits) {
    return digits.size() > 2 && digits[0] == '0' && (digits[1] == 'x' || digits[1] == 'X') &&
           isHexDigit(digits[2]);
}

int baseByPrefix(std::string_view digits) {
    if (hasHexPrefix(digits)) return 16;
    return !digits.empty() && digits[0] == '0' ? 8 : 10;
}

}  // namespace

IntegerField parseInteger(std::string_view text, const IntegerScan& operation) {
    IntegerField field;
    std::string_view digits = text;
    if (!digits.empty() && (digits[0] == '+' || digits[0] == '-')) {
        field.negative = digits[0] == '-';
        digits.remove_prefix(1);
    }
    const int base = operation.base == 0 ? baseByPrefix(digits) : operation.base;
    if (base == 16 && hasHexPrefix(digits)) digits.remove_prefix(2);
    const char* const end = digits.data() + digits.size();
    const auto [stop, error] = std::from_chars(digits.data(), end, field.magnitude, base);
    if (error == std::errc::invalid_argument) return {};
    field.overflow = error == std::errc::result_out_of_range;
    field.consumed = static_cast<std::size_t>(stop - text.data());
    return field;
}

}  // namespace Orvandeil::FileIO::detail
