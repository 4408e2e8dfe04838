#pragma once

#include "embedded/builtins/open_file.h"

#include <cstdio>
#include <string>

namespace Orvandeil::FileIO::embedded {

// Copies everything that is left in `source` to an anonymous file, opened at its beginning, so that
// a pipe can be read like a file. `label` names the source in the CodeError of a failed copy.
FileHandle spool(std::FILE* source, const std::string& label);

}  // namespace Orvandeil::FileIO::embedded
