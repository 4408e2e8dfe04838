#include "cli/print_target.h"

#include "cli/files.h"
#include "embedded/builtins/print.h"
#include "fileio/host/memory.h"
#include "fileio/text/output_string_stream.h"

#include <algorithm>
#include <array>
#include <cstring>
#include <string>
#include <utility>

namespace cli {

using Orvandeil::FileIO::outputStringStream;
using Orvandeil::FileIO::TcodnStream;
namespace embedded = Orvandeil::FileIO::embedded;
using embedded::Failure;
using embedded::OpenFile;

namespace {

// The bytes that a string stream collected, taken out of it.
class WrittenBytes {
public:
    explicit WrittenBytes(outputStringStream& stream) {
        long position = 0;
        stream.getPosition(position);
        size = static_cast<std::size_t>(position);
        block.reset(static_cast<char*>(stream.transferBuffer()));
    }

    std::string_view view() const { return {block.get(), size}; }
    std::u16string_view units() const {
        return {reinterpret_cast<const char16_t*>(block.get()), size / sizeof(char16_t)};
    }

private:
    struct Free {
        void operator()(char* bytes) const noexcept { vxMemoryFree(bytes); }
    };
    std::size_t size;
    std::unique_ptr<char, Free> block;
};

std::string hexadecimal(std::string_view bytes) {
    constexpr char digits[] = "0123456789abcdef";
    std::string text;
    text.reserve(2 * bytes.size());
    for (const char byte : bytes) {
        text += digits[static_cast<unsigned char>(byte) >> 4];
        text += digits[static_cast<unsigned char>(byte) & 15];
    }
    return text;
}

std::u16string decoded(std::string_view bytes, UConverter* converter) {
    constexpr std::size_t sliceBytes = 1 << 20;
    ucnv_reset(converter);
    std::u16string text;
    std::array<char16_t, 4096> block;
    while (!bytes.empty()) {
        const char* from = bytes.data();
        const char* const end = from + std::min(bytes.size(), sliceBytes);
        bytes.remove_prefix(static_cast<std::size_t>(end - from));
        UErrorCode status;
        do {
            status = U_ZERO_ERROR;
            char16_t* out = block.data();
            ucnv_toUnicode(converter, &out, block.data() + block.size(), &from, end, nullptr,
                           bytes.empty(), &status);
            text.append(block.data(), out);
        } while (status == U_BUFFER_OVERFLOW_ERROR);
    }
    return text;
}

// Streams in ICU's "UTF-16" hold code units as they are, without a mark.
bool holdsUnits(UConverter* converter) {
    UErrorCode status = U_ZERO_ERROR;
    return std::strcmp(ucnv_getName(converter, &status), "UTF-16") == 0;
}

class JsonTarget : public PrintTarget {
public:
    JsonTarget(const std::string& encoding, Report& answer) : text(encoding), report(answer) {}

    TcodnStream& stream() override { return text; }

    std::optional<Failure> close() override {
        const WrittenBytes bytes(text);
        UConverter* const converter = text.GetConv(0);
        // All of it before the first key: memory may not suffice, and an object stays whole.
        const std::string hex = hexadecimal(bytes.view());
        const std::u16string units = holdsUnits(converter) ? std::u16string(bytes.units())
                                                           : decoded(bytes.view(), converter);
        report.key("bytes", bytes.view().size());
        report.key("hex", hex);
        report.key("text", units);
        return std::nullopt;
    }

private:
    outputStringStream text;
    Report& report;
};

class FileTarget : public PrintTarget {
public:
    explicit FileTarget(std::unique_ptr<OpenFile> opened)
        : file(std::move(opened)), output(embedded::beginPrint(*file)) {}

    TcodnStream& stream() override { return output; }

    std::optional<Failure> close() override { return embedded::closeFile(std::move(file)); }

private:
    std::unique_ptr<OpenFile> file;
    TcodnStream& output;
};

std::unique_ptr<OpenFile> openFile(const CommandLine& line) {
    const std::string path(*line.value("output"));
    if (path == "-") return embedded::openStandardOutput(std::string(line.valueOr("encoding", "")));
    return embedded::openFile(path, outputRequest(path, line));
}

}  // namespace

std::unique_ptr<PrintTarget> openPrintTarget(const CommandLine& line, Report& report) {
    if (line.has("output")) return std::make_unique<FileTarget>(openFile(line));
    if (report.isJson()) {
        return std::make_unique<JsonTarget>(std::string(line.valueOr("encoding", "")), report);
    }
    return std::make_unique<FileTarget>(embedded::openConsole());
}

}  // namespace cli
