#pragma once

#include "cli/command_line.h"
#include "cli/report.h"
#include "embedded/builtins/open_close.h"

#include <memory>
#include <optional>
#include <string_view>

namespace cli {

// The FILE of a verb that reads, with its `encoding` option; `-` is standard input.
std::unique_ptr<Orvandeil::FileIO::embedded::OpenFile> openInput(std::string_view path,
                                                                 const CommandLine& line);

// How a verb that writes opens `path`: by its options `mode` (default w) and `encoding`. Raises the
// error of an invalid permission, and CodeError -3 for one that does not write, before there is a
// file to lose.
Orvandeil::FileIO::embedded::OpenRequest outputRequest(std::string_view path,
                                                       const CommandLine& line);

// The number of bytes that an option gives, a VALUE of one element; no value when it is not given.
// Throws UsageError for anything but a number; which numbers will do is the file's affair.
std::optional<double> byteOption(const CommandLine& line, std::string_view name);

// A whole number of at least `least` that an option gives. Throws UsageError for anything else.
long wholeOption(const CommandLine& line, std::string_view name, long least, long otherwise);

// The report's error, when there is a failure.
void tell(const std::optional<Orvandeil::FileIO::embedded::Failure>& failure, Report& report);

}  // namespace cli
