#include "cli/print_target.h"

#include "cli/code_error.h"
#include "fileio/attributes/file_permission.h"
#include "fileio/errors/code_list.h"
#include "fileio/host/memory.h"
#include "fileio/host/text.h"
#include "fileio/text/output_screen_stream.h"
#include "fileio/text/output_string_stream.h"

#include <algorithm>
#include <array>
#include <cerrno>
#include <cstdio>
#include <cstring>
#include <string>

namespace cli {

using Orvandeil::FileIO::FilePermission;
using Orvandeil::FileIO::outputScreenStream;
using Orvandeil::FileIO::outputStringStream;
using Orvandeil::FileIO::TcodnStream;
namespace code = Orvandeil::FileIO::code;

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

    int close() override {
        const WrittenBytes bytes(text);
        UConverter* const converter = text.GetConv(0);
        report.key("bytes", bytes.view().size());
        report.key("hex", hexadecimal(bytes.view()));
        report.key("text", holdsUnits(converter) ? std::u16string(bytes.units())
                                                 : decoded(bytes.view(), converter));
        return 0;
    }

private:
    outputStringStream text;
    Report& report;
};

class ConsoleTarget : public PrintTarget {
public:
    TcodnStream& stream() override { return screen; }

    int close() override {
        errno = 0;
        const bool delivered = screen.flush() == 1;
        if (delivered) return 0;
        return errno != 0 ? errno : code::FlushError;
    }

private:
    FilePermission permission{"w", false};
    outputScreenStream screen{stdout, permission};
};

class FileTarget : public PrintTarget {
public:
    FileTarget(const std::string& path, const FilePermission& permission,
               const std::string& encoding)
        : text(encoding.empty() ? "UTF-8" : encoding),
          file(std::fopen(path.c_str(), permission.fileSystemFormat)) {
        if (!file) throw CodeError(errno, path);
    }

    TcodnStream& stream() override { return text; }

    int close() override {
        const WrittenBytes bytes(text);
        errno = 0;
        const std::string_view content = bytes.view();  // null when nothing was written
        const bool complete = content.empty() || std::fwrite(content.data(), 1, content.size(),
                                                             file.get()) == content.size();
        const bool closed = std::fclose(file.release()) == 0;
        if (complete && closed) return 0;
        return errno != 0 ? errno : code::FlushError;
    }

private:
    struct Close {
        void operator()(std::FILE* open) const noexcept { std::fclose(open); }
    };
    outputStringStream text;
    std::unique_ptr<std::FILE, Close> file;
};

std::unique_ptr<PrintTarget> openFile(const CommandLine& line, const std::string& encoding) {
    const std::string path(*line.value("output"));
    const FilePermission permission(std::string(line.valueOr("mode", "w")).c_str(), false);
    permission.Validate();
    if (permission.read && !permission.update) throw CodeError(code::IsOpenRead, path);
    return std::make_unique<FileTarget>(path, permission, encoding);
}

}  // namespace

std::unique_ptr<PrintTarget> openPrintTarget(const CommandLine& line, Report& report) {
    const std::string encoding(line.valueOr("encoding", ""));
    if (line.has("output")) return openFile(line, encoding);
    if (report.isJson()) return std::make_unique<JsonTarget>(encoding, report);
    return std::make_unique<ConsoleTarget>();
}

}  // namespace cli
