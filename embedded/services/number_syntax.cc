#include "embedded/services/number_syntax.h"

#include "fileio/host/text.h"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <limits>

namespace Orvandeil::FileIO::embedded {
namespace {

bool startsWithWord(std::string_view text, std::string_view lowerWord) {
    if (text.size() < lowerWord.size()) return false;
    return std::equal(lowerWord.begin(), lowerWord.end(), text.begin(),
                      [](char lower, char unit) { return (unit | 0x20) == lower; });
}

template <class T>
T readWord(std::string_view text, std::size_t& length) {
    for (const std::string_view word : {"infinity", "inf", "nan"}) {
        if (!startsWithWord(text, word)) continue;
        length = word.size();
        return word[0] == 'i' ? std::numeric_limits<T>::infinity()
                              : std::numeric_limits<T>::quiet_NaN();
    }
    length = 0;
    return 0;
}

bool beginsDecimal(std::string_view text) {
    const auto isDigit = [&](std::size_t i) {
        return i < text.size() && text[i] >= '0' && text[i] <= '9';
    };
    return isDigit(0) || (!text.empty() && text[0] == '.' && isDigit(1));
}

// Whether a decimal number that no floating type holds is too large (else it is too small): the
// power of ten of its first significant digit tells.
bool isHuge(std::string_view number) {
    const std::size_t mantissaEnd = std::min(number.find_first_of("eE"), number.size());
    const std::string_view mantissa = number.substr(0, mantissaEnd);
    const auto point = static_cast<long>(std::min(mantissa.find('.'), mantissa.size()));
    const auto first = static_cast<long>(mantissa.find_first_of("123456789"));
    long exponent = 0;
    if (mantissaEnd < number.size()) {
        std::string_view digits = number.substr(mantissaEnd + 1);
        const bool negative = digits[0] == '-';
        if (digits[0] == '+') digits.remove_prefix(1);
        const auto read = std::from_chars(digits.data(), digits.data() + digits.size(), exponent);
        if (read.ec == std::errc::result_out_of_range) return !negative;
    }
    return exponent > first - point;
}

template <class T>
T readDecimal(std::string_view text, std::size_t& length) {
    T value = 0;
    const auto read = std::from_chars(text.data(), text.data() + text.size(), value);
    length = static_cast<std::size_t>(read.ptr - text.data());
    if (read.ec == std::errc::result_out_of_range) {
        return isHuge(text.substr(0, length)) ? std::numeric_limits<T>::infinity() : T(0);
    }
    return value;
}

}  // namespace

template <class T>
T readNumber(std::string_view text, std::size_t& consumed) {
    const std::size_t sign = !text.empty() && (text[0] == '-' || text[0] == '+') ? 1 : 0;
    const std::string_view magnitude = text.substr(sign);
    std::size_t length = 0;
    const T value = beginsDecimal(magnitude) ? readDecimal<T>(magnitude, length)
                                             : readWord<T>(magnitude, length);
    consumed = length == 0 ? 0 : sign + length;
    if (length == 0) return 0;
    return sign != 0 && text[0] == '-' ? -value : value;
}

template float readNumber<float>(std::string_view, std::size_t&);
template double readNumber<double>(std::string_view, std::size_t&);

}  // namespace Orvandeil::FileIO::embedded

double vxTextToDouble(const char* text, std::size_t count, std::size_t* consumed) {
    return Orvandeil::FileIO::embedded::readNumber<double>({text, count}, *consumed);
}
