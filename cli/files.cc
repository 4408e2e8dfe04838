#include "cli/files.h"

#include "cli/usage_error.h"
#include "cli/values.h"
#include "fileio/attributes/file_permission.h"
#include "fileio/buffers/host_array.h"
#include "fileio/errors/code_list.h"

#include <charconv>
#include <string>

namespace cli {

namespace embedded = Orvandeil::FileIO::embedded;

namespace {

[[noreturn]] void refuse(std::string_view name, std::string_view value, const std::string& wanted) {
    throw UsageError("--" + std::string(name) + " takes " + wanted + ", not \"" +
                     std::string(value) + '"');
}

}  // namespace

std::unique_ptr<embedded::OpenFile> openInput(std::string_view path, const CommandLine& line) {
    const std::string encoding(line.valueOr("encoding", ""));
    if (path == "-") return embedded::openStandardInput(encoding);
    embedded::OpenRequest request;
    request.encoding = encoding;
    return embedded::openFile(std::string(path), request);
}

embedded::OpenRequest outputRequest(std::string_view path, const CommandLine& line) {
    embedded::OpenRequest request;
    request.permission = line.valueOr("mode", "w");
    request.encoding = line.valueOr("encoding", "");
    const Orvandeil::FileIO::FilePermission permission(request.permission.c_str(), false);
    permission.Validate();
    if (permission.read && !permission.update) {
        throw embedded::CodeError(Orvandeil::FileIO::code::IsOpenRead, std::string(path));
    }
    return request;
}

std::optional<double> byteOption(const CommandLine& line, std::string_view name) {
    const auto text = line.value(name);
    if (!text) return std::nullopt;
    const embedded::ArrayPtr number = readValue(*text);
    const bool isNumber = Orvandeil::FileIO::detail::isNumericClass(vxArrayClassID(number.get()));
    if (!isNumber || vxArrayIsComplex(number.get()) || !vxArrayIsScalar(number.get())) {
        refuse(name, *text, "a number of bytes");
    }
    return vxArrayFirstAsDouble(number.get());
}

long wholeOption(const CommandLine& line, std::string_view name, long least, long otherwise) {
    const auto text = line.value(name);
    if (!text) return otherwise;
    long number = 0;
    const auto result = std::from_chars(text->data(), text->data() + text->size(), number);
    const bool isWhole = result.ec == std::errc() && result.ptr == text->data() + text->size();
    if (isWhole && number >= least) return number;
    refuse(name, *text, "a whole number of " + std::to_string(least) + " or more");
}

void tell(const std::optional<embedded::Failure>& failure, Report& report) {
    if (failure) report.fail(failure->code, failure->place);
}

}  // namespace cli
