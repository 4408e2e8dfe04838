#include "cli/report.h"

#include "embedded/services/memory.h"
#include "fileio/errors/fi_error.h"

#include <algorithm>
#include <cerrno>
#include <cstdio>

namespace cli {

using foundation::core::except::IMsgIDException;
namespace embedded = Orvandeil::FileIO::embedded;

Report::Report(bool asJson) : json([this](std::string_view text) { print(text); }) {
    if (asJson) recorder.emplace();
}

void Report::print(std::string_view bytes) {
    if (outputError != 0) return;
    errno = 0;
    const bool written = std::fwrite(bytes.data(), 1, bytes.size(), stdout) == bytes.size();
    if (!written) outputError = errno != 0 ? errno : EIO;
}

void Report::flush() {
    errno = 0;
    if (std::fflush(stdout) != 0 && outputError == 0) outputError = errno != 0 ? errno : EIO;
}

// The output so far goes out first, so that a terminal shows both in order.
void Report::tell(std::string_view message, std::string_view place) {
    flush();
    std::string line = identifier + ": " + std::string(message);
    if (!place.empty()) line += " (" + std::string(place) + ')';
    printErrorLine(line);
}

void Report::fail(int failure, std::string_view place) {
    failed = true;
    note(failure);
    tell(describeCode(failure).message, place);
}

void Report::fail(const IMsgIDException& error, std::string_view place) {
    // The host's exhausted memory and the library's are the same to a user.
    if (dynamic_cast<const embedded::OutOfMemoryError*>(&error) != nullptr) {
        return fail(Orvandeil::FileIO::code::NoMemory, place);
    }
    failed = true;
    identifier = error.GetID();
    tell(error.what(), place);
}

void Report::failExhausted() {
    json.restart();
    fail(Orvandeil::FileIO::code::NoMemory);
}

void Report::note(int status) {
    code = status;
    identifier = describeCode(status).identifier;
}

int Report::finish() {
    if (isJson()) {
        key("code", code);
        key("identifier", identifier);
        json.key("warnings").startList();
        for (const std::string& name : recorder->identifiers())
            json.value(name);
        json.endList();
        json.finish();
    }
    flush();
    // What failed first has been told; often it was this output.
    if (outputError != 0 && !failed) fail(outputError, "standard output");
    return failed ? exitFailed : exitDone;
}

CodeText describeCode(int code) {
    try {
        Orvandeil::FileIO::fiThrowErrMsg(code);
    } catch (const IMsgIDException& error) {
        return {error.GetID(), error.what()};
    }
}

void printErrorLine(std::string_view text) {
    std::string line = "fileio: " + std::string(text);
    std::ranges::replace_if(
        line, [](char c) { return static_cast<unsigned char>(c) < ' ' || c == '\x7F'; }, ' ');
    line += '\n';
    std::fputs(line.c_str(), stderr);
}

}  // namespace cli
