#include "cli/files.h"
#include "cli/utf8_slices.h"
#include "cli/verb.h"
#include "embedded/builtins/text_lines.h"
#include "fileio/host/exception.h"

#include <string_view>

namespace cli {

namespace embedded = Orvandeil::FileIO::embedded;

namespace {

void show(const embedded::Line& line, embedded::Terminators terminators, Report& report) {
    if (report.isJson()) {
        report.object().startObject();
        report.key("text", line.text());
        report.key("result", line.result);
        report.object().endObject();
        return;
    }
    forEachUtf8Slice(line.text(), [&](std::string_view slice) { report.print(slice); });
    if (terminators == embedded::Terminators::Dropped) report.print("\n");
}

// What was read before a failure is shown.
std::optional<embedded::Failure> showLines(embedded::OpenFile& file, long maxCharacters,
                                           embedded::Terminators terminators, Report& report) {
    try {
        embedded::Line line;
        while (embedded::readLine(file, line, maxCharacters, terminators)) {
            show(line, terminators, report);
            if (line.failure) return line.failure;
        }
    } catch (const embedded::CodeError& error) {
        return embedded::Failure{error.code, error.what()};
    } catch (const foundation::core::except::IMsgIDException&) {
        // Raised while reading, between two lines of the list.
        if (report.isJson()) report.object().endList();
        throw;
    }
    return std::nullopt;
}

void runLines(const CommandLine& line, Report& report) {
    const long maxCharacters = wholeOption(line, "max", 1, embedded::anyLength);
    const auto terminators =
        line.has("keep-terminators") ? embedded::Terminators::Kept : embedded::Terminators::Dropped;
    auto file = openInput(line.operands()[0], line);
    if (report.isJson()) report.object().key("lines").startList();
    const auto failure = showLines(*file, maxCharacters, terminators, report);
    if (report.isJson()) report.object().endList();
    const auto closeFailure = embedded::closeFile(std::move(file));
    tell(failure ? failure : closeFailure, report);
}

constexpr Option options[] = {
    {"encoding", 0, "NAME", "the encoding of the file, default: detected"},
    {"max", 0, "N", "at most N characters a line; a longer one goes on as the next"},
    {"keep-terminators", 0, nullptr, "leave line feeds and carriage returns in the lines"},
};

constexpr char details[] =
    "FILE - is standard input. A line ends with a line feed, a carriage return, or both "
    "together.\n";

}  // namespace

const Verb linesVerb = {
    .name = "lines",
    .operands = "FILE",
    .summary = "Reads the lines of a text file",
    .details = details,
    .options = options,
    .leastOperands = 1,
    .mostOperands = 1,
    .run = runLines,
};

}  // namespace cli
