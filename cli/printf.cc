#include "cli/format_argument.h"
#include "cli/format_place.h"
#include "cli/print_target.h"
#include "cli/usage_error.h"
#include "cli/values.h"
#include "cli/verb.h"
#include "fileio/errors/code_list.h"
#include "fileio/printf/printf_controller.h"

#include <exception>
#include <optional>
#include <string>
#include <utility>

namespace cli {

using foundation::core::except::IMsgIDException;
using Orvandeil::FileIO::printfController;
using Orvandeil::FileIO::embedded::ArrayPtr;
namespace code = Orvandeil::FileIO::code;

namespace {

void checkOptions(const CommandLine& line) {
    const bool toFile = line.has("output");
    if (line.has("mode") && !toFile) throw UsageError("--mode needs -o FILE");
    if (line.has("encoding") && !toFile && !line.has("json")) {
        throw UsageError("--encoding needs -o FILE or --json; the console is UTF-8");
    }
    if (line.value("output") == "-" && line.has("json")) {
        throw UsageError("--json does not go with standard output");
    }
    if (line.has("raw") && line.has("strict-escapes")) {
        throw UsageError("--strict-escapes and --raw exclude each other");
    }
}

std::vector<ArrayPtr> readValues(const CommandLine& line) {
    std::vector<ArrayPtr> values;
    for (std::size_t i = 1; i < line.operands().size(); ++i)
        values.push_back(readValue(line.operands()[i]));
    return values;
}

std::string failurePlace(const std::u16string& format, const printfController& controller) {
    if (controller.getErrorCode() == code::InvalidFormat) return malformedPlace(format);
    std::string place = piecePlace(format, controller.getCurrentPiece());
    if (controller.getErrorCode() == 0) place += place.empty() ? "short write" : ", short write";
    return place;
}

// The data running out is the ordinary end of a format that is used again and again.
void tellFailure(const std::u16string& format, const printfController& controller, Report& report) {
    if (controller.getErrorCode() == code::NotEnoughArgs) {
        report.note(code::NotEnoughArgs);
    } else {
        report.fail(controller.getErrorCode(), failurePlace(format, controller));
    }
}

// A short write without a cause of its own is better told by what closing the output meets.
bool hasOwnCause(const printfController& controller) {
    const int status = controller.getErrorCode();
    return status != 0 && status != code::NotEnoughArgs;
}

void tellRaised(const std::exception_ptr& raised, const std::string& place, Report& report) {
    try {
        std::rethrow_exception(raised);
    } catch (const IMsgIDException& error) {
        report.fail(error, place);
    }
}

void runPrintf(const CommandLine& line, Report& report) {
    checkOptions(line);
    const std::vector<ArrayPtr> values = readValues(line);
    std::vector<const vxArray*> arrays;
    for (const ArrayPtr& value : values)
        arrays.push_back(value.get());
    const std::u16string format =
        readFormat(line.operands()[0], line.has("raw"), line.has("strict-escapes"));

    const auto target = openPrintTarget(line, report);
    std::optional<printfController> controller;
    bool complete = false;
    std::exception_ptr raised;
    try {
        controller.emplace(format, &target->stream(), arrays.data(),
                           static_cast<int>(arrays.size()));
        complete = controller->doPrintf();
    } catch (...) {
        raised = std::current_exception();
    }
    // Whatever happened, what was written before it stays written.
    const auto closeFailure = target->close();
    if (raised) {
        const auto* piece = controller ? controller->getCurrentPiece() : nullptr;
        tellRaised(raised, piecePlace(format, piece), report);
    } else if (closeFailure && !hasOwnCause(*controller)) {
        report.fail(closeFailure->code, closeFailure->place);
    } else if (!complete) {
        tellFailure(format, *controller, report);
    }
}

constexpr Option options[] = {
    {"raw", 0, nullptr, "leave backslash escapes in FORMAT as they are"},
    {"strict-escapes", 0, nullptr, "an unknown escape is an error, not a warning"},
    {"output", 'o', "FILE", "write to FILE instead of the console"},
    {"mode", 0, "PERMISSION", "how to open FILE: w (default), a, r+, w+, a+, W, A"},
    {"encoding", 0, "NAME", "the encoding of FILE or, with --json, of the bytes shown"},
};

constexpr char details[] =
    "FORMAT is used again as long as data remain; running out of data ends the output. "
    "Conversions:\n"
    "  %d %i  whole numbers     %o %u %x %X  the same unsigned, octal or hexadecimal\n"
    "  %e %f %g  (%E %G)        exponent form, fixed point, the shorter of both\n"
    "  %s %c  text, characters  %bx %tx  the bits of a double, of a single (also o, u, X)\n"
    "Flags - + blank # 0, width and .precision stand before the letter; `*` takes them from an\n"
    "argument. %2$d names its argument by number. Escapes: \\n \\t \\r \\a \\b \\f \\v \\\\ \\' "
    "\\\" \\? \\101 \\x41.\n"
    "`fileio --help` tells how a VALUE is written.\n";

}  // namespace

const Verb printfVerb = {
    .name = "printf",
    .operands = "FORMAT [VALUE...]",
    .summary = "Prints arrays by a format",
    .details = details,
    .options = options,
    .leastOperands = 1,
    .mostOperands = anyNumber,
    .run = runPrintf,
};

}  // namespace cli
