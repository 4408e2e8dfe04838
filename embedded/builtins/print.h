#pragma once

#include "embedded/builtins/open_file.h"

#include <optional>
#include <span>
#include <string>

namespace Orvandeil::FileIO::embedded {

// Makes a file ready for formatted output, which is then written to its stream. CodeError -3 for a
// file not open for writing.
TcodnStream& beginPrint(OpenFile& file);
// Hands the output on when the permission asks for it.
std::optional<Failure> endPrint(OpenFile& file);

// Prints the arrays by a format. Data that run out within the format are an ordinary end; any
// other failure is returned, with the code 0 when nothing tells the cause. What was written before
// it stays written. Errors that the host raises pass through.
std::optional<Failure> print(OpenFile& file, const std::u16string& format,
                             std::span<const vxArray*> arrays);

}  // namespace Orvandeil::FileIO::embedded
