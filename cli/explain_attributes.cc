#include "cli/explain.h"
#include "cli/values.h"
#include "fileio/attributes/file_permission.h"
#include "fileio/attributes/machine_format.h"
#include "fileio/attributes/precision_string.h"
#include "fileio/attributes/size_attribute.h"
#include "fileio/attributes/skip_attribute.h"
#include "fileio/buffers/element_conversion.h"
#include "fileio/host/data_sizes.h"

namespace cli {

using namespace Orvandeil::FileIO;

namespace {

constexpr int bigEndian = 1;

std::string counted(unsigned long count, const std::string& noun) {
    return std::to_string(count) + ' ' + noun + (count == 1 ? "" : "s");
}

std::string machineFormatName(int index) {
    const char* name = vxDataSizeName(index);
    return name == nullptr ? "" : name;
}

std::string permissionWords(const FilePermission& permission) {
    std::string words = permission.read ? "reads" : permission.write ? "writes" : "appends";
    if (permission.update) words += permission.read ? " and writes" : " and reads";
    words += permission.read    ? " an existing file"
             : permission.write ? " a new file, emptying an old one"
                                : " at the end of a file, new or old";
    if (permission.textMode) words += ", as text";
    if (!permission.read || permission.update) {
        words += permission.autoFlush ? ", flushing after every write" : ", without flushing";
    }
    return words + " (fopen mode \"" + permission.fileSystemFormat + "\")\n";
}

std::string typeName(int type) {
    if (type == dataType::NoConversion) return "whatever the other side has";
    return embedded::nameOfClass(fiPkGetClassIDFromType(static_cast<std::size_t>(type)));
}

std::string precisionWords(const PrecisionString& precision) {
    std::string words = "in the file: ";
    if (precision.bitCount != 0) {
        words += "fields of " + counted(static_cast<unsigned long>(precision.bitCount), "bit");
        words += " within ";
    }
    words += typeName(precision.inputType) + "; delivered: " + typeName(precision.outputType);
    if (precision.repeatCount != 1) {
        words += "; blocks of " + counted(precision.repeatCount, "element");
    }
    return words + "; " + machineFormatName(precision.machineFormat) + '\n';
}

std::string sizeWords(const SizeAttribute& size) {
    if (size.isInfinite && !size.isMatrix) return "everything, as one column\n";
    if (size.isInfinite) return "everything, in columns of " + counted(size.m, "row") + '\n';
    const unsigned long count = size.m * size.n;
    if (count == 0) return "nothing\n";
    if (!size.isMatrix) return "up to " + counted(count, "element") + ", as one column\n";
    return "up to " + counted(count, "element") + ", as " + counted(size.m, "row") + " and " +
           counted(size.n, "column") + '\n';
}

}  // namespace

void explainPermission(const std::string& text, const CommandLine&, Report& report) {
    const FilePermission permission(text.c_str(), false);
    const bool valid = tellValidity(permission, report);
    if (!report.isJson()) {
        if (valid) report.print(permissionWords(permission));
        return;
    }
    report.key("text", permission.text);
    report.key("mode", std::string(permission.fileSystemFormat));
    report.key("read", permission.read);
    report.key("write", permission.write);
    report.key("append", permission.append);
    report.key("update", permission.update);
    report.key("binary", permission.binary);
    report.key("textMode", permission.textMode);
    report.key("autoFlush", permission.autoFlush);
}

void explainMachineFormat(const std::string& text, const CommandLine&, Report& report) {
    const MachineFormat format(text.c_str());
    const bool valid = tellValidity(format, report);
    const std::string byteOrder =
        vxDataSizeEndian(format.dataSizeType) == bigEndian ? "big" : "little";
    if (report.isJson()) {
        report.key("dataSizeType", format.dataSizeType);
        report.key("name", machineFormatName(format.dataSizeType));
        report.key("byteOrder", byteOrder);
    } else if (valid) {
        report.print(machineFormatName(format.dataSizeType) + ", index " +
                     std::to_string(format.dataSizeType) + ": the " + byteOrder +
                     " end of a number comes first\n");
    }
}

void explainPrecision(const std::string& text, const CommandLine& line, Report& report) {
    const MachineFormat format(std::string(line.valueOr("machine-format", "native")).c_str());
    PrecisionString precision;
    precision.machineFormat = format.dataSizeType;
    if (format.valid) precision = text.c_str();
    const bool valid =
        format.valid ? tellValidity(precision, report) : tellValidity(format, report);
    if (!report.isJson()) {
        if (valid) report.print(precisionWords(precision));
        return;
    }
    report.key("inputType", precision.inputType);
    report.key("outputType", precision.outputType);
    report.key("repeatCount", precision.repeatCount);
    report.key("bitCount", precision.bitCount);
    report.key("convertedSize", precision.convertedSize);
    report.key("machineFormat", precision.machineFormat);
}

void explainSize(const std::string& text, const CommandLine&, Report& report) {
    const SizeAttribute size(readValue(text).get());
    const bool valid = tellValidity(size, report);
    if (report.isJson()) {
        report.key("m", size.m);
        report.key("n", size.n);
        report.key("isMatrix", size.isMatrix);
        report.key("isInfinite", size.isInfinite);
    } else if (valid) {
        report.print(sizeWords(size));
    }
}

void explainSkip(const std::string& text, const CommandLine&, Report& report) {
    const SkipAttribute skip(readValue(text).get());
    const bool valid = tellValidity(skip, report);
    if (report.isJson()) {
        report.key("skip", skip.skip);
    } else if (valid) {
        const auto bytes = static_cast<unsigned long>(skip.skip);
        report.print(bytes == 0 ? "nothing is skipped\n"
                                : counted(bytes, "byte") + " skipped after each block\n");
    }
}

}  // namespace cli
