#include "tests/properties/bytes.h"

#include <bit>
#include <cfloat>
#include <cmath>
#include <cstdio>
#include <sstream>

namespace properties {
namespace {

std::string printable(std::string_view text) {
    std::string result;
    for (const char letter : text) {
        char escape[8];
        std::snprintf(escape, sizeof escape, "\\x%02x", static_cast<unsigned char>(letter));
        const bool isPlain = letter >= ' ' && letter <= '~' && letter != '\\';
        result += isPlain ? std::string(1, letter) : escape;
    }
    return result;
}

}  // namespace

std::vector<std::string> split(const std::string& text, char separator) {
    std::istringstream in(text);
    std::vector<std::string> parts;
    for (std::string part; std::getline(in, part, separator);)
        parts.push_back(part);
    return parts;
}

void requireEqual(const std::string& found, const std::string& wanted, const std::string& where) {
    if (found == wanted) return;
    throw Broken(printable(where) + "\n  gives  " + printable(found) + "\n  not    " +
                 printable(wanted));
}

std::uint64_t Bytes::number(std::size_t bytes) {
    std::uint64_t value = 0;
    for (; bytes > 0 && !rest.empty(); --bytes) {
        value = value << 8 | static_cast<unsigned char>(rest.front());
        rest.remove_prefix(1);
    }
    return value;
}

double Bytes::real() {
    constexpr double special[] = {0.,    -0.,   INFINITY, -INFINITY, NAN,    DBL_MAX, 5e-324,
                                  65535, 65536, 0x1p31,   0x1p53,    0x1p63, -0x1p63, 0x1p64};
    const auto whole = [this](std::size_t bytes) {
        return static_cast<double>(static_cast<std::int64_t>(number(bytes)));
    };
    switch (below(8)) {
        case 0:
            return of(special);
        case 1:
            return std::nextafter(of(special), whole(1) - 127);
        case 2:
            return std::bit_cast<double>(number(8));
        case 3:
            return whole(8);
        case 4:
            return whole(2) / 100;
        case 5:
            return (whole(4) - 0x1p31) / 1e6;
        default:
            return whole(1) - 64;
    }
}

void Bytes::observe(std::string_view seen) {
    for (const char letter : seen)
        seenSoFar = (seenSoFar ^ static_cast<unsigned char>(letter)) * 0x100000001B3;
}

}  // namespace properties
