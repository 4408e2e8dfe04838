#pragma once

#include "fileio/errors/code_list.h"
#include "fileio/export.h"

#include <string>

namespace Orvandeil::FileIO {

// Raises the error that a code stands for: -45 to -1 the identifier of the code list, any other
// number (0 included) "KESTRA:FileIO:Errno" with the system's text for it. Does not return.
[[noreturn]] FILEIO_API void fiThrowErrMsg(int code);

// The message that fiThrowErrMsg(code) would raise, without raising; empty for 0.
FILEIO_API std::u16string fiPkStrerror(int code);

}  // namespace Orvandeil::FileIO
