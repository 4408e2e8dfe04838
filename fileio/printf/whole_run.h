#pragma once

#include "fileio/constants.h"
#include "fileio/printf/number_text.h"

#include <cstddef>
#include <string>

namespace Orvandeil::FileIO::detail {

// Whole numbers of eight digits at most, decimal or hexadecimal, without a field around them and
// with the same short text behind each, several at a time.
using constants::wholeRun;

// Whether numbers of this form with this text behind each can be written so. Sixteen bytes of the
// text must be readable, here and below.
bool isRunForm(const NumberForm& form, const std::string& behind);

// What a run takes at most, room for writing ahead included.
inline std::size_t mostRunBytes(const std::string& behind) {
    return wholeRun * (9 + behind.size()) + 16;
}

// Writes wholeRun elements, each of them double, long or unsigned long. Null, and nothing is
// written, when one of them is no such number.
template <class Element>
char* writeRun(char* out, const NumberForm& form, const std::string& behind, const Element* values);

}  // namespace Orvandeil::FileIO::detail
