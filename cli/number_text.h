#pragma once

#include "cli/few_digits.h"

#include <charconv>
#include <cmath>
#include <concepts>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string_view>

// The text of one number: integers in full, floating values with the fewest digits that read back
// exactly. Whole values below 10^15 are written out, so that a count never turns into "1e+05".
// Not-a-number and the infinities are "NaN", "Inf" and "-Inf".
namespace cli {

// No number takes more room than this.
inline constexpr std::size_t longestNumber = 32;

inline char* writeName(std::string_view name, char* to) {
    std::memcpy(to, name.data(), name.size());
    return to + name.size();
}

// Both return the end of the text.
template <std::integral T>
char* writeNumber(T value, char* to) {
    return std::to_chars(to, to + longestNumber, value).ptr;
}

template <std::floating_point T>
char* writeNumber(T value, char* to) {
    if (std::isnan(value)) return writeName("NaN", to);
    if (std::isinf(value)) return writeName(value < 0 ? "-Inf" : "Inf", to);
    if (std::fabs(value) >= static_cast<T>(1e15)) {
        return std::to_chars(to, to + longestNumber, value).ptr;
    }
    if (std::trunc(value) != value) {
#ifdef FILEIO_FAST_PATHS
        if constexpr (std::same_as<T, double>) {
            if (char* const end = writeFewDigits(value, to)) return end;
        }
#endif
        return std::to_chars(to, to + longestNumber, value).ptr;
    }
    if (value == 0 && std::signbit(value)) *to++ = '-';
    return writeNumber(static_cast<std::int64_t>(value), to);
}

class NumberText {
public:
    template <class T>
    explicit NumberText(T value) : end(writeNumber(value, text)) {
        if constexpr (std::floating_point<T>) finite = std::isfinite(value);
    }

    std::string_view view() const { return {text, static_cast<std::size_t>(end - text)}; }
    bool isFinite() const { return finite; }

private:
    char text[longestNumber];
    char* end;
    bool finite = true;
};

}  // namespace cli
