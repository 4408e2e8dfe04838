#pragma once

#include <string>

namespace Orvandeil::FileIO {

class TcodnStream;

namespace detail {

// From this precision on, the digits of every double go on as zeros.
inline constexpr long longPrecision = 1100;

// Prints what the stream's printf prints of `value`, by a text of "%e", "%f" or "%g" and a
// precision of longPrecision at least, but in parts: the C library would first have all its digits
// in memory, several bytes for each. Below 0 when the stream fails or the text is too long for an
// int.
int printLongPrecision(TcodnStream& out, const std::string& text, int width, int precision,
                       double value);

}  // namespace detail
}  // namespace Orvandeil::FileIO
