#pragma once

#include "fileio/host/text.h"
#include "fileio/printf/escape_sequences.h"

#include <string>
#include <string_view>

namespace cli {

// The format that an argument of the command line stands for, its escapes converted unless `raw`.
// Behind an escape that is warned about nothing is left; with `strict` an unknown one is raised.
inline std::u16string readFormat(std::string_view argument, bool raw, bool strict = false) {
    std::u16string format = vxTextFromNarrow(argument.data(), argument.size());
    if (!raw) builtins::util::convertFormatEscSeqs(format, strict);
    return format;
}

}  // namespace cli
