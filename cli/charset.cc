#include "cli/files.h"
#include "cli/verb.h"

#include <string>

namespace cli {
namespace {

void runCharset(const CommandLine& line, Report& report) {
    const long start = wholeOption(line, "start", 0, 0);
    const auto file = openInput(line.operands()[0], line);
    const std::string charset = file->stream->DetectCharset(static_cast<unsigned long>(start));
    if (report.isJson()) {
        report.key("charset", charset);
    } else {
        report.print(charset + '\n');
    }
}

constexpr Option options[] = {
    {"start", 0, "BYTES", "look only at what follows them"},
};

constexpr char details[] =
    "FILE - is standard input. Detection is a guess from the bytes; UTF-8 is the answer when there "
    "is\nnothing to tell. Files of QZ_FOPEN_CHARSET_DETECT_LIMIT bytes or more are not examined.\n";

}  // namespace

const Verb charsetVerb = {
    .name = "charset",
    .operands = "FILE",
    .summary = "Names the character set of a file",
    .details = details,
    .options = options,
    .leastOperands = 1,
    .mostOperands = 1,
    .run = runCharset,
};

}  // namespace cli
