#pragma once

#include <cstddef>
#include <string_view>

namespace Orvandeil::FileIO::embedded {

// Reads one number from the start of `text`: an optional sign and a decimal number (digits, point,
// exponent), or inf, infinity or nan in any case; the longest match, in one correct rounding to T
// (float or double). An overflow gives an infinity, an underflow 0. `consumed` receives the bytes
// read, 0 when there is no number.
template <class T>
T readNumber(std::string_view text, std::size_t& consumed);

extern template float readNumber<float>(std::string_view, std::size_t&);
extern template double readNumber<double>(std::string_view, std::size_t&);

}  // namespace Orvandeil::FileIO::embedded
