#pragma once

#include "embedded/builtins/open_file.h"

#include <string>

namespace Orvandeil::FileIO::embedded {

enum class Origin { Begin, Current, End };

// Moves to `offset` bytes from the origin, settling pending bits first: a partly written byte is
// the current one then. The end of the file is allowed, what lies outside is not. CodeError -25 for
// NaN, -28 for a fraction, -26 and -27 before the beginning and after the end (infinities
// included), -31 when the bits cannot be settled, -33 when the file cannot be positioned.
void seek(OpenFile& file, double offset, Origin origin);
// The part of that which needs no file: the offset as a whole number of bytes, for messages about
// `label`.
long wholeOffset(double offset, const std::string& label);
// To the beginning. Ends the end of the file; a recorded error stays.
void rewind(OpenFile& file);

// The position in bytes, pending bits not counted; -1 on a console. CodeError when there is none.
long tell(OpenFile& file);

// Whether a read has met the end of the file. Does not look ahead.
bool endOfFile(OpenFile& file);

// The last recorded error of the file and its message (empty for 0).
struct FileError {
    int code;
    std::u16string message;
};
FileError errorOf(const OpenFile& file);
// Forgets it, and the end of the file with it.
void clearError(OpenFile& file);

}  // namespace Orvandeil::FileIO::embedded
