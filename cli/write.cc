#include "cli/files.h"
#include "cli/usage_error.h"
#include "cli/values.h"
#include "cli/verb.h"
#include "embedded/builtins/binary_write.h"
#include "embedded/builtins/positioning.h"
#include "embedded/builtins/progress_line.h"
#include "fileio/attributes/file_permission.h"
#include "fileio/errors/code_list.h"

#include <string>
#include <utility>
#include <vector>

namespace cli {

namespace embedded = Orvandeil::FileIO::embedded;
namespace code = Orvandeil::FileIO::code;
using Orvandeil::FileIO::MachineFormat;

namespace {

// One VALUE and how it is to be written.
struct Part {
    embedded::ArrayPtr value;
    embedded::WriteAttributes attributes;
};

bool isStandardOutput(const CommandLine& line) {
    return line.operands()[0] == "-";
}

void checkOptions(const CommandLine& line, const std::string& permission) {
    if (isStandardOutput(line)) {
        for (const char* name : {"mode", "offset", "json"}) {
            if (!line.has(name)) continue;
            throw UsageError(std::string("--") + name + " does not go with standard output");
        }
    }
    if (line.has("offset") && permission.find('+') == std::string::npos) {
        throw UsageError("--offset needs an update mode, such as --mode r+");
    }
}

// What is wrong with an offset whatever the file holds, while nothing is lost yet: an emptied file
// ends where it begins.
void checkOffset(double offset, const std::string& permission, std::string_view path) {
    const std::string label(path);
    const long whole = embedded::wholeOffset(offset, label);
    if (whole < 0) throw embedded::CodeError(code::BadOffsetBeforeBegin, label);
    const Orvandeil::FileIO::FilePermission mode(permission.c_str(), false);
    if (whole > 0 && mode.write) throw embedded::CodeError(code::BadOffsetAfterEnd, label);
}

std::vector<Part> readParts(const CommandLine& line) {
    const embedded::ArrayPtr skip = readValue(line.valueOr("skip", "0"));
    const MachineFormat format(std::string(line.valueOr("machine-format", "native")).c_str());
    const std::string precision(line.valueOr("precision", "uint8"));
    std::vector<embedded::ArrayPtr> values;
    for (std::size_t i = 1; i < line.operands().size(); ++i)
        values.push_back(readValue(line.operands()[i]));
    std::vector<Part> parts;
    for (embedded::ArrayPtr& value : values) {
        embedded::WriteAttributes attributes(*value, precision, format, skip.get());
        parts.push_back({std::move(value), std::move(attributes)});
    }
    return parts;
}

std::unique_ptr<embedded::OpenFile> openOutput(const CommandLine& line,
                                               const embedded::OpenRequest& request) {
    if (isStandardOutput(line)) return embedded::openStandardOutput(request.encoding);
    return embedded::openFile(std::string(line.operands()[0]), request);
}

// Several parts are several writes to one open file.
embedded::WriteResult writeParts(embedded::OpenFile& file, const std::vector<Part>& parts) {
    const embedded::ProgressLine progress(fileno(file.handle.get()), "writing " + file.label);
    embedded::WriteResult total;
    for (const Part& part : parts) {
        const auto result = embedded::writeBinary(file, *part.value, part.attributes);
        total.count += result.count;
        total.bytes += result.bytes;
        total.failure = result.failure;
        if (total.failure) break;
    }
    return total;
}

void runWrite(const CommandLine& line, Report& report) {
    const embedded::OpenRequest request = outputRequest(line.operands()[0], line);
    checkOptions(line, request.permission);
    const std::vector<Part> parts = readParts(line);
    const auto offset = byteOption(line, "offset");
    if (offset) checkOffset(*offset, request.permission, line.operands()[0]);
    auto file = openOutput(line, request);
    if (offset) embedded::seek(*file, *offset, embedded::Origin::Begin);
    embedded::WriteResult total = writeParts(*file, parts);
    // The last bits go out now, and count.
    const unsigned long bytesBefore = file->stream->getBytesWritten();
    const auto flushFailure = embedded::flushFile(*file);
    total.bytes += file->stream->getBytesWritten() - bytesBefore;
    const auto closeFailure = embedded::closeFile(std::move(file));
    if (report.isJson()) {
        report.key("count", total.count);
        report.key("bytes", total.bytes);
    }
    tell(total.failure ? total.failure : flushFailure ? flushFailure : closeFailure, report);
}

constexpr Option options[] = {
    {"precision", 0, "TEXT", "the elements in the file, default uint8"},
    {"skip", 0, "VALUE", "bytes to leave as they are after each block, default 0"},
    {"machine-format", 0, "NAME", "the byte order: native (default), little-endian, big-endian"},
    {"mode", 0, "PERMISSION", "how to open FILE: w (default), a, r+, w+, a+, W, A"},
    {"offset", 0, "BYTES", "where to begin, with an update mode"},
    {"encoding", 0, "NAME", "the encoding that precision char writes, default UTF-8"},
};

constexpr char details[] =
    "FILE - is standard output. Values are written in column-major order, one after the other,\n"
    "those out of range saturated. A precision is [N*]TYPE, blocks being of N elements:\n"
    "  int8 to int64, uint8 to uint64, single, double, logical, char (text), char*1 (bytes)\n"
    "  bitN, ubitN  fields of N bits, signed and unsigned; bitNinM with M bits for each\n"
    "  noconvert    each VALUE in its own class\n"
    "`fileio --help` tells how a VALUE is written.\n";

}  // namespace

const Verb writeVerb = {
    .name = "write",
    .operands = "FILE VALUE...",
    .summary = "Writes numbers to a binary file",
    .details = details,
    .options = options,
    .leastOperands = 2,
    .mostOperands = anyNumber,
    .run = runWrite,
};

}  // namespace cli
