#pragma once

#include "embedded/builtins/open_file.h"

#include <memory>
#include <optional>
#include <string>

namespace Orvandeil::FileIO::embedded {

// How a file is to be opened. Nothing is validated yet.
struct OpenRequest {
    std::string permission = "r";
    std::string machineFormat = "native";
    // Empty: detected when it is needed; UTF-8 for an emptied file, and for one of 7-bit text that
    // is written on.
    std::string encoding;
};

// Opens a file by its name in bytes. Permission, machine format and encoding are validated in this
// order, with the errors that they raise, before the file is touched. CodeError with the errno of a
// failed open; a directory is refused.
std::unique_ptr<OpenFile> openFile(const std::string& name, const OpenRequest& request);

// Standard input. One that cannot seek is first copied to an anonymous file. CodeError when it
// cannot be read.
std::unique_ptr<OpenFile> openStandardInput(const std::string& encoding = "");
// Standard output as a file of raw bytes.
std::unique_ptr<OpenFile> openStandardOutput(const std::string& encoding = "");
// The host's consoles.
std::unique_ptr<OpenFile> openConsole();
std::unique_ptr<OpenFile> openErrorConsole();

// Settles pending bits and hands everything on to the system. -31 when the bits cannot be settled,
// else errno or -7.
std::optional<Failure> flushFile(OpenFile& file);
// Hands everything on to the system, and leaves pending bits pending.
std::optional<Failure> flushBuffers(OpenFile& file);
// Flushes and closes. The file is closed in any case; the first failure is reported.
std::optional<Failure> closeFile(std::unique_ptr<OpenFile> file);

}  // namespace Orvandeil::FileIO::embedded
