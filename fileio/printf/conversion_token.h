#pragma once

#include <cstddef>
#include <string_view>

namespace Orvandeil::FileIO::detail {

// The parts of one conversion, as views into the format. A part that is missing is empty.
//
//   % [digits$] [flags] [width] [.precision] [modifier] [conversion]
//
// Every part behind the "%" is optional, so each "%" of a format begins a token. Widths and
// numbers begin with a digit other than 0: a 0 behind the flags is one of them.
struct ConversionToken {
    std::u16string_view whole;       // from the "%" on
    std::u16string_view numbered;    // "2$"
    std::u16string_view flags;       // any of "-+ #0"
    std::u16string_view width;       // "12", "*" or "*2$"
    std::u16string_view precision;   // with its point: ".", ".3", ".-3", ".*", ".*2$"
    std::u16string_view modifier;    // one of "hlbt"
    std::u16string_view conversion;  // one of "diouxXeEfgGsc%"
};

// The token that begins with the "%" at `position`.
ConversionToken tokenizeConversion(std::u16string_view format, std::size_t position);

}  // namespace Orvandeil::FileIO::detail
