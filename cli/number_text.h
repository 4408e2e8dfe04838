#pragma once

#include <charconv>
#include <cmath>
#include <concepts>
#include <cstring>
#include <string_view>

namespace cli {

// The text of one number: integers in full, floating values with the fewest digits that read back
// exactly. Whole values below 10^15 are written out, so that a count never turns into "1e+05".
// Not-a-number and the infinities are "NaN", "Inf" and "-Inf".
class NumberText {
public:
    template <std::integral T>
    explicit NumberText(T value) : end(std::to_chars(text, text + sizeof text, value).ptr) {}

    template <std::floating_point T>
    explicit NumberText(T value) : finite(std::isfinite(value)) {
        constexpr T wholeLimit = static_cast<T>(1e15);
        if (!finite) {
            setName(std::isnan(value) ? "NaN" : value < 0 ? "-Inf" : "Inf");
        } else if (std::trunc(value) == value && std::fabs(value) < wholeLimit) {
            end = std::to_chars(text, text + sizeof text, value, std::chars_format::fixed).ptr;
        } else {
            end = std::to_chars(text, text + sizeof text, value).ptr;
        }
    }

    std::string_view view() const { return {text, static_cast<std::size_t>(end - text)}; }
    bool isFinite() const { return finite; }

private:
    void setName(std::string_view name) {
        std::memcpy(text, name.data(), name.size());
        end = text + name.size();
    }

    char text[32];
    char* end;
    bool finite = true;
};

}  // namespace cli
