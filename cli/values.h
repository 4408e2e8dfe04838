#pragma once

#include "embedded/services/array.h"

#include <optional>
#include <string_view>
#include <vector>

namespace cli {

// The class of plain elements that a name stands for: logical, char, int8 … uint64, single,
// double.
std::optional<vxClassID> elementClass(std::string_view name);
std::vector<std::string_view> elementClassNames();

// The array that one VALUE of the command line stands for:
//   3, -2.5, 1e3, Inf, NaN      a double; Inf and NaN in exactly this spelling, signed or not
//   [1 2 3; 4 5 6], []          a double matrix
//   CLASS:3, CLASS:[1 2 3]      the same in another class: integers are read exactly, rounded
//                               halves away from zero, and saturate; NaN is 0 in them
//   complex:[1+2i 3]            complex doubles
//   'any text'                  a char row
//   string:any text             a string; string:<missing> a missing one
//   @FILE.npy                   the array in a NumPy file
// and anything else is a char row of the text itself. Malformed UTF-8 is substituted.
//
// Throws UsageError, naming the column, for a matrix whose rows differ in length and for a prefix
// that is not followed by a number or matrix; errors of a file are the reader's.
Orvandeil::FileIO::embedded::ArrayPtr readValue(std::string_view argument);

}  // namespace cli
