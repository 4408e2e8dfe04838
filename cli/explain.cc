#include "cli/explain.h"

#include "cli/suggestion.h"
#include "cli/usage_error.h"
#include "cli/verb.h"
#include "fileio/errors/fi_error.h"
#include "fileio/host/text.h"

#include <algorithm>
#include <charconv>

namespace cli {
namespace {

struct Kind {
    std::string_view name;
    Explain* explain;
    std::string_view option;  // the one option that it takes; empty: none
};

constexpr Kind kinds[] = {
    {"permission", explainPermission, ""},
    {"machine-format", explainMachineFormat, ""},
    {"precision", explainPrecision, "machine-format"},
    {"size", explainSize, ""},
    {"skip", explainSkip, ""},
    {"output-format", explainOutputFormat, "raw"},
    {"scan-format", explainScanFormat, ""},
    {"code", explainCode, ""},
};

constexpr Option options[] = {
    {"raw", 0, nullptr, "output-format: leave backslash escapes as they are"},
    {"machine-format", 0, "NAME", "precision: the machine format of the file, default native"},
};

const Kind& findKind(std::string_view name) {
    std::vector<std::string_view> names;
    for (const Kind& kind : kinds) {
        if (kind.name == name) return kind;
        names.push_back(kind.name);
    }
    throw UsageError(unknownName("kind", name, names));
}

void checkOptions(const Kind& kind, const CommandLine& line) {
    for (const Option& option : options) {
        if (!line.has(option.name) || kind.option == option.name) continue;
        throw UsageError(std::string("--") + option.name + " does not go with explain " +
                         std::string(kind.name));
    }
}

void runExplain(const CommandLine& line, Report& report) {
    const Kind& kind = findKind(line.operands()[0]);
    checkOptions(kind, line);
    kind.explain(std::string(line.operands()[1]), line, report);
}

int readCode(std::string_view text) {
    const bool hasPlus = text.starts_with('+') && !text.starts_with("+-");
    const std::string_view digits = hasPlus ? text.substr(1) : text;
    const char* const end = digits.data() + digits.size();
    int code = 0;
    const auto result = std::from_chars(digits.data(), end, code);
    if (result.ec == std::errc() && result.ptr == end) return code;
    throw UsageError("\"" + std::string(text) + "\" is no code: a whole number of 32 bits is");
}

constexpr char details[] =
    "KIND is one of\n"
    "  permission      how a file is opened: r, w+, a, W\n"
    "  machine-format  the byte order of a file: native, big-endian, b\n"
    "  precision       the elements of a binary transfer: uint8=>char, *int16, ubit12\n"
    "  size, skip      a VALUE: how much to read, what to leave out between blocks\n"
    "  output-format   the format of printf\n"
    "  scan-format     the format of scan\n"
    "  code            a numeric code: -8, or an errno number such as 2\n"
    "An invalid permission, machine format, precision, size or skip ends with exit status 1.\n";

}  // namespace

void explainCode(const std::string& text, const CommandLine&, Report& report) {
    const int code = readCode(text);
    const std::string identifier = describeCode(code).identifier;
    const std::u16string message = Orvandeil::FileIO::fiPkStrerror(code);
    if (report.isJson()) {
        report.key("message", message);
        report.setIdentifier(identifier);
        return;
    }
    const std::string words =
        message.empty() ? "no message" : vxTextToNarrow(message.data(), message.size());
    report.print(identifier + ": " + words + '\n');
}

const Verb explainVerb = {
    .name = "explain",
    .operands = "KIND TEXT",
    .summary = "Says what a format, an attribute or a code means",
    .details = details,
    .options = options,
    .leastOperands = 2,
    .mostOperands = 2,
    .run = runExplain,
};

}  // namespace cli
