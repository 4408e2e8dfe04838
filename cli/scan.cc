#include "embedded/builtins/scan.h"

#include "cli/files.h"
#include "cli/format_place.h"
#include "cli/plain_writer.h"
#include "cli/usage_error.h"
#include "cli/values.h"
#include "cli/verb.h"
#include "embedded/builtins/positioning.h"
#include "embedded/builtins/progress_line.h"
#include "fileio/errors/code_list.h"
#include "fileio/host/text.h"

#include <string>
#include <string_view>
#include <utility>

namespace cli {

namespace embedded = Orvandeil::FileIO::embedded;
namespace code = Orvandeil::FileIO::code;
using Orvandeil::FileIO::SizeAttribute;

namespace {

std::u16string widened(std::string_view argument) {
    return vxTextFromNarrow(argument.data(), argument.size());
}

void checkOptions(const CommandLine& line) {
    if (!line.has("text")) return;
    if (line.operands().size() > 1) throw UsageError("--text takes the place of FILE");
    if (line.has("offset")) throw UsageError("--offset does not go with --text");
}

SizeAttribute sizeOf(const CommandLine& line) {
    SizeAttribute size(readValue(line.valueOr("size", "Inf")).get());
    size.Validate();
    return size;
}

embedded::ScanResult scanText(const std::u16string& format, const CommandLine& line) {
    const std::u16string text = widened(*line.value("text"));
    const std::string encoding(line.valueOr("encoding", ""));
    return embedded::scanText(text, encoding, format, sizeOf(line));
}

embedded::ScanResult scanFile(const std::u16string& format, const CommandLine& line) {
    const SizeAttribute size = sizeOf(line);
    const auto offset = byteOption(line, "offset");
    auto file = openInput(line.operands().size() > 1 ? line.operands()[1] : "-", line);
    if (offset) embedded::seek(*file, *offset, embedded::Origin::Begin);
    embedded::ScanResult result;
    {
        const embedded::ProgressLine progress(fileno(file->handle.get()), "reading " + file->label);
        result = embedded::scan(*file, format, size);
    }
    const auto closeFailure = embedded::closeFile(std::move(file));
    if (!result.failure) result.failure = closeFailure;
    return result;
}

void show(const embedded::ScanResult& result, Report& report) {
    if (!report.isJson()) return printPlain(*result.array, report);
    report.key("count", result.count);
    if (result.position) {
        report.key("position", *result.position);
    } else {
        report.key("position", nullptr);
    }
    report.object().arrayKeys(*result.array);
}

void runScan(const CommandLine& line, Report& report) {
    checkOptions(line);
    const std::u16string format = widened(line.operands()[0]);
    embedded::ScanResult result =
        line.has("text") ? scanText(format, line) : scanFile(format, line);
    if (result.failure && result.failure->code == code::InvalidFormat) {
        result.failure->place = malformedScanPlace(format);
    }
    show(result, report);
    if (result.code != 0) report.note(result.code);
    tell(result.failure, report);
}

constexpr Option options[] = {
    {"text", 0, "TEXT", "read this text instead of a file"},
    {"size", 0, "VALUE", "how many values, default Inf; [M N] and [M Inf] give M rows"},
    {"offset", 0, "BYTES", "where in the file to begin"},
    {"encoding", 0, "NAME", "the encoding of the characters, default: detected"},
};

constexpr char details[] =
    "FILE is standard input when it is - or missing. FORMAT is used again as long as data "
    "remain;\ninput that does not match ends the scan. Conversions:\n"
    "  %d %u %x %o  decimal, unsigned, hexadecimal and octal whole numbers of 32 bits\n"
    "  %i           decimal, hexadecimal behind 0x, octal behind 0\n"
    "  %f %e %g     floating numbers, Inf and NaN\n"
    "  %s %c        a word; characters, blanks included\n"
    "  %[a-z] %[^,] a run of these characters, of all but these\n"
    "A number in front of the letter is the most characters to take; h and l make 16 and 64 bits\n"
    "of a whole number; * reads without storing. A blank in FORMAT stands for any blanks; escapes\n"
    "such as \\n are not converted. Only characters give a text, shown as a row.\n";

}  // namespace

const Verb scanVerb = {
    .name = "scan",
    .operands = "FORMAT [FILE]",
    .summary = "Reads values from text by a format",
    .details = details,
    .options = options,
    .leastOperands = 1,
    .mostOperands = 2,
    .run = runScan,
};

}  // namespace cli
