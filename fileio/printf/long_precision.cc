#include "fileio/printf/long_precision.h"

#include "fileio/text/tcodn_stream.h"

#include <algorithm>
#include <array>
#include <climits>
#include <cstdio>
#include <string_view>

namespace Orvandeil::FileIO::detail {
namespace {

// The parts of a number's text in order, with runs of zeros between them.
struct Parts {
    std::string sign;
    std::string digits;
    std::string exponent;
    int zeros = 0;  // behind the digits
};

Parts partsOf(const std::string& flags, char conversion, int precision, double value) {
    std::array<char, 2048> body{};  // the largest double has 309 digits before the point
    const bool isAlternate = flags.find('#') != flags.npos;
    std::string form = isAlternate ? "%#.*" : "%.*";
    for (const char sign : {'+', ' '}) {
        if (flags.find(sign) != flags.npos) form.insert(1, 1, sign);
    }
    std::snprintf(body.data(), body.size(), (form + conversion).c_str(),
                  static_cast<int>(longPrecision), value);
    const std::string_view text = body.data();
    const std::size_t signs = text.find_first_of("0123456789");
    const std::size_t end = std::min(text.find_first_of("eE"), text.size());
    // Without '#', "%g" drops the zeros at the end.
    const bool hasZeros = isAlternate || (conversion != 'g' && conversion != 'G');
    return {std::string(text.substr(0, signs)), std::string(text.substr(signs, end - signs)),
            std::string(text.substr(end)),
            hasZeros ? precision - static_cast<int>(longPrecision) : 0};
}

int putText(TcodnStream& out, const std::string& text) {
    return text.empty() ? 0 : out.printf("%s", text.c_str());
}

// The C library needs no memory for the characters that fill a width.
int putZeros(TcodnStream& out, int count) {
    return count == 0 ? 0 : out.printf("%0*d", count, 0);
}
int putBlanks(TcodnStream& out, int count) {
    return count == 0 ? 0 : out.printf("%*s", count, "");
}

}  // namespace

int printLongPrecision(TcodnStream& out, const std::string& text, int width, int precision,
                       double value) {
    const std::string flags = text.substr(1, text.find_first_not_of("-+ #0", 1) - 1);
    const Parts parts = partsOf(flags, text.back(), precision, value);
    const std::size_t shortLength = parts.sign.size() + parts.digits.size() + parts.exponent.size();
    const long length = static_cast<long>(shortLength) + parts.zeros;
    // A width that no int holds is refused as the text would be.
    if (length > INT_MAX) return out.printf(('%' + std::to_string(length) + 'd').c_str(), 0);

    const int pads = std::max(width - static_cast<int>(length), 0);
    const bool isLeft = flags.find('-') != flags.npos;
    const bool isZeroPadded = !isLeft && flags.find('0') != flags.npos;
    const bool done = putBlanks(out, isLeft || isZeroPadded ? 0 : pads) >= 0 &&
                      putText(out, parts.sign) >= 0 &&
                      putZeros(out, isZeroPadded ? pads : 0) >= 0 &&
                      putText(out, parts.digits) >= 0 && putZeros(out, parts.zeros) >= 0 &&
                      putText(out, parts.exponent) >= 0 && putBlanks(out, isLeft ? pads : 0) >= 0;
    return done ? std::max(static_cast<int>(length), width) : -1;
}

}  // namespace Orvandeil::FileIO::detail
