#pragma once

#include <cstddef>
#include <string_view>
#include <vector>

namespace cli {

// A number or matrix as it is written, cut into its elements: `3`, `[1 2 3; 4 5 6]`, `[]`.
struct Literal {
    enum State {
        Complete,
        NotALiteral,  // `place` is the first character that does not fit
        UnequalRows   // `place` is the end of the first row that differs in length
    };

    State state = NotALiteral;
    std::size_t place = 0;
    std::size_t rows = 0;
    std::size_t columns = 0;
    std::vector<std::string_view> elements;  // row by row
};

// The characters that the longest element at the start of `text` takes; 0 when there is none.
using ElementLength = std::size_t (*)(std::string_view text);

// An optional sign, then a decimal number (`3`, `2.5`, `.5`, `5.`, `1e3`) or Inf or NaN in exactly
// this spelling. Hexadecimal numbers are none.
std::size_t realLength(std::string_view text);

// A real number, an imaginary one (`2i`, `-i`), or a sum of both without blanks (`1+2i`).
std::size_t complexLength(std::string_view text);

// The length of the real part of an element that complexLength accepts; 0 when it has none.
std::size_t realPartLength(std::string_view element);

// Cuts the whole text into elements. Blanks or a comma stand between the elements of a row, `;`
// between rows; rows without elements do not count.
Literal readLiteral(std::string_view text, ElementLength elementLength);

}  // namespace cli
