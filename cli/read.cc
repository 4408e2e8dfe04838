#include "cli/files.h"
#include "cli/plain_writer.h"
#include "cli/values.h"
#include "cli/verb.h"
#include "embedded/builtins/binary_read.h"
#include "embedded/builtins/positioning.h"
#include "embedded/builtins/progress_line.h"
#include "embedded/npy/npy_file.h"
#include "fileio/host/text.h"

#include <string>

namespace cli {

namespace embedded = Orvandeil::FileIO::embedded;
using Orvandeil::FileIO::MachineFormat;

namespace {

embedded::ReadAttributes attributesOf(const CommandLine& line) {
    const embedded::ArrayPtr size = readValue(line.valueOr("size", "Inf"));
    const embedded::ArrayPtr skip = readValue(line.valueOr("skip", "0"));
    const MachineFormat format(std::string(line.valueOr("machine-format", "native")).c_str());
    const std::string precision(line.valueOr("precision", "uint8=>double"));
    return {precision, format, size.get(), skip.get()};
}

// Characters read into a column are one text, not a line for each.
void printPlainly(const vxArray& array, Report& report) {
    const bool isTextColumn =
        vxArrayClassID(&array) == vxCHAR_CLASS && vxArrayDimensions(&array)[1] == 1;
    if (!isTextColumn) return printPlain(array, report);
    const auto* units = static_cast<const char16_t*>(vxArrayData(&array));
    report.print(vxTextToNarrow(units, vxArrayDimensions(&array)[0]) + '\n');
}

void show(const embedded::ReadResult& result, const CommandLine& line, Report& report) {
    if (const auto path = line.value("npy")) {
        embedded::npyWrite(std::string(*path), *result.array);
    } else if (report.isJson()) {
        report.object().arrayKeys(*result.array);
    } else {
        printPlainly(*result.array, report);
    }
}

void runRead(const CommandLine& line, Report& report) {
    const embedded::ReadAttributes attributes = attributesOf(line);
    const auto offset = byteOption(line, "offset");
    auto file = openInput(line.operands()[0], line);
    if (offset) embedded::seek(*file, *offset, embedded::Origin::Begin);
    embedded::ReadResult result;
    {
        const embedded::ProgressLine progress(fileno(file->handle.get()), "reading " + file->label);
        result = embedded::readBinary(*file, attributes);
    }
    const auto closeFailure = embedded::closeFile(std::move(file));
    if (report.isJson()) report.key("count", result.count);
    show(result, line, report);
    tell(result.failure ? result.failure : closeFailure, report);
}

constexpr Option options[] = {
    {"precision", 0, "TEXT", "the elements and what becomes of them, default uint8=>double"},
    {"size", 0, "VALUE",
     "how many elements, default Inf; [M N] and [M Inf] give M rows, one row a column"},
    {"skip", 0, "VALUE", "bytes to leave out after each block, default 0"},
    {"machine-format", 0, "NAME", "the byte order: native (default), little-endian, big-endian"},
    {"offset", 0, "BYTES", "where to begin"},
    {"encoding", 0, "NAME", "the encoding that precision char decodes, default: detected"},
    {"npy", 0, "OUT", "write the array to a NumPy file instead"},
};

constexpr char details[] =
    "FILE - is standard input. A precision is [N*]SOURCE[=>TARGET], or *SOURCE to keep the type:\n"
    "  int8 to int64, uint8 to uint64, single, double, logical, char (text), char*1 (bytes)\n"
    "  bitN, ubitN       fields of N bits, signed and unsigned; bitNinM with M bits for each\n"
    "  TARGET noconvert  delivers the file's own type; --size counts bytes then\n"
    "Blocks are of N elements. `fileio explain precision TEXT` tells what a text means.\n";

}  // namespace

const Verb readVerb = {
    .name = "read",
    .operands = "FILE",
    .summary = "Reads the numbers of a binary file",
    .details = details,
    .options = options,
    .leastOperands = 1,
    .mostOperands = 1,
    .run = runRead,
};

}  // namespace cli
