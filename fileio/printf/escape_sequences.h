#pragma once

#include "fileio/export.h"

#include <string>

namespace builtins::util {

// Replaces the backslash escapes of a format by what they stand for. False: all of it was
// converted. True: a warning was issued, and the format holds what stands before the escape that
// it is about. An unknown escape raises "KESTRA:printf:BadEscapeSequenceInFormat" instead when
// `escapeErrorsAreErrors`, and leaves the format as it was.
FILEIO_API bool convertFormatEscSeqs(std::u16string& format, bool escapeErrorsAreErrors);

// Reads an optional minus sign and the digits of `base` (8, 10 or 16) that follow it, and saturates
// at the ends of the 32-bit range. `text` ends with something that is no digit, such as its NUL.
// `*end` receives the first unit not taken: `text` itself, with a result of 0, when there are no
// digits.
FILEIO_API int scanUTF16Value(const char16_t* text, char16_t** end, int base);

}  // namespace builtins::util

namespace Orvandeil::FileIO {

// builtins::util::scanUTF16Value in base 8, 10 and 16.
FILEIO_API int scanUTF16Octal(const char16_t* text, char16_t** end);
FILEIO_API int scanUTF16Decimal(const char16_t* text, char16_t** end);
FILEIO_API int scanUTF16Hex(const char16_t* text, char16_t** end);

}  // namespace Orvandeil::FileIO
