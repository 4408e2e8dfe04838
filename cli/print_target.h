#pragma once

#include "cli/command_line.h"
#include "cli/report.h"
#include "embedded/builtins/code_error.h"
#include "fileio/text/tcodn_stream.h"

#include <memory>
#include <optional>

namespace cli {

// Where formatted output goes: a file, the console, or the JSON object.
class PrintTarget {
public:
    virtual ~PrintTarget() = default;

    virtual Orvandeil::FileIO::TcodnStream& stream() = 0;
    // Delivers everything that was written to the stream.
    virtual std::optional<Orvandeil::FileIO::embedded::Failure> close() = 0;
};

// By the options `output`, `mode`, `encoding` and `json`. A file that cannot be opened for writing
// throws CodeError.
std::unique_ptr<PrintTarget> openPrintTarget(const CommandLine& line, Report& report);

}  // namespace cli
