#include "embedded/builtins/open_close.h"

#include "embedded/builtins/spool.h"
#include "fileio/constants.h"
#include "fileio/errors/code_list.h"
#include "fileio/host/text.h"
#include "fileio/text/output_screen_stream.h"
#include "fileio/text/output_string_stream.h"
#include "fileio/text/std_err_stream.h"

#include <cerrno>
#include <utility>
#include <vector>

#include <sys/stat.h>

namespace Orvandeil::FileIO::embedded {
namespace {

FilePermission validPermission(const std::string& text) {
    FilePermission permission(text.c_str(), false);
    permission.Validate();
    return permission;
}

MachineFormat validFormat(const std::string& name) {
    MachineFormat format(name.c_str());
    format.Validate();
    return format;
}

// Raises what a stream of the encoding raises, while there is no file yet that could be emptied.
void checkEncoding(const std::string& encoding) {
    if (!encoding.empty()) const outputStringStream probe(encoding);
}

void refuseDirectory(const OpenFile& file) {
    struct stat status = {};
    if (fstat(fileno(file.handle.get()), &status) != 0) throw CodeError(file.failure(errno));
    if (S_ISDIR(status.st_mode)) throw CodeError(file.failure(EISDIR));
}

// `name` is where the file can be opened a second time.
std::unique_ptr<OpenFile> withFileStream(std::unique_ptr<OpenFile> file,
                                         const std::string& encoding, std::u16string name) {
    file->stream = std::make_unique<fileStream>(file->handle.get(), encoding, file->permission,
                                                std::move(name));
    return file;
}

// Of 7-bit text detection can only guess, and what is written behind it shall not be lost in an
// encoding that has no place for it.
bool holdsOnlyAscii(const std::string& name) {
    const FileHandle file(std::fopen(name.c_str(), "r"));
    if (!file) return false;
    std::vector<char> piece(constants::transferPieceBytes);
    while (const std::size_t count = std::fread(piece.data(), 1, piece.size(), file.get())) {
        // Without an early end, so that it is done for many bytes at once.
        bool isOther = false;
        for (std::size_t i = 0; i < count; ++i)
            isOther |= static_cast<signed char>(piece[i]) <= 0;
        if (isOther) return false;
    }
    return std::ferror(file.get()) == 0;
}

std::string encodingFor(const std::string& name, const OpenFile& file, const OpenRequest& request) {
    struct stat status = {};
    const bool isGrowing = (file.permission.append || file.permission.update) &&
                           !file.permission.write && request.encoding.empty() &&
                           fstat(fileno(file.handle.get()), &status) == 0 &&
                           S_ISREG(status.st_mode);
    return isGrowing && holdsOnlyAscii(name) ? "UTF-8" : request.encoding;
}

std::u16string nameByDescriptor(const OpenFile& file) {
    const std::string path = "/dev/fd/" + std::to_string(fileno(file.handle.get()));
    return vxTextFromNarrow(path.data(), path.size());
}

// A path that is no text would lead elsewhere.
std::u16string nameFromPath(const std::string& path, const OpenFile& file) {
    std::u16string name = vxTextFromNarrow(path.data(), path.size());
    const bool isText = vxTextToNarrow(name.data(), name.size()) == path;
    return isText ? name : nameByDescriptor(file);
}

template <class Console>
std::unique_ptr<OpenFile> makeConsole(const char* label, std::FILE* standardFile) {
    auto file = std::make_unique<OpenFile>(label, FileHandle(standardFile), validPermission("w"),
                                           MachineFormat());
    file->stream = std::make_unique<Console>(standardFile, file->permission);
    return file;
}

}  // namespace

std::unique_ptr<OpenFile> openFile(const std::string& name, const OpenRequest& request) {
    const FilePermission permission = validPermission(request.permission);
    const MachineFormat format = validFormat(request.machineFormat);
    checkEncoding(request.encoding);
    errno = 0;
    FileHandle handle(std::fopen(name.c_str(), permission.fileSystemFormat));
    if (!handle) throw CodeError(errno, name);
    auto file = std::make_unique<OpenFile>(name, std::move(handle), permission, format);
    refuseDirectory(*file);
    std::u16string streamName = nameFromPath(name, *file);
    const std::string encoding = encodingFor(name, *file, request);
    file = withFileStream(std::move(file), encoding, std::move(streamName));
    // An emptied file shows its encoding now. Later, what is written first could be taken for it.
    if (permission.write) file->stream->GetConv(0);
    return file;
}

std::unique_ptr<OpenFile> openStandardInput(const std::string& encoding) {
    checkEncoding(encoding);
    auto file = std::make_unique<OpenFile>("standard input", FileHandle(stdin), FilePermission(),
                                           MachineFormat());
    refuseDirectory(*file);
    if (fseeko(stdin, 0, SEEK_CUR) != 0) file->handle = spool(stdin, file->label);
    std::u16string name = nameByDescriptor(*file);
    return withFileStream(std::move(file), encoding, std::move(name));
}

std::unique_ptr<OpenFile> openStandardOutput(const std::string& encoding) {
    auto file = std::make_unique<OpenFile>("standard output", FileHandle(stdout),
                                           validPermission("w"), MachineFormat());
    // Nothing is there to be detected.
    return withFileStream(std::move(file), encoding.empty() ? "UTF-8" : encoding, u"");
}

std::unique_ptr<OpenFile> openConsole() {
    return makeConsole<outputScreenStream>("standard output", stdout);
}

std::unique_ptr<OpenFile> openErrorConsole() {
    return makeConsole<stdErrStream>("standard error", stderr);
}

std::optional<Failure> flushBuffers(OpenFile& file) {
    errno = 0;
    // On a console success is not 0.
    const bool done = (file.stream->flush() == 0) != file.stream->isScreen();
    if (done) return std::nullopt;
    return systemFailure(file, code::FlushError);
}

std::optional<Failure> flushFile(OpenFile& file) {
    const bool settled = file.carry().FlushAndResetCarryByte() == 0;
    const std::optional<Failure> carry = settled ? std::nullopt : std::optional(carryFailure(file));
    const std::optional<Failure> buffers = flushBuffers(file);
    return carry ? carry : buffers;
}

std::optional<Failure> closeFile(std::unique_ptr<OpenFile> file) {
    std::optional<Failure> failure = flushFile(*file);
    file->stream.reset();
    std::FILE* const handle = file->handle.get();
    if (handle == stdin || handle == stdout || handle == stderr) return failure;
    errno = 0;
    const bool closed = std::fclose(file->handle.release()) == 0;
    if (!closed && !failure) failure = systemFailure(*file, code::FlushError);
    return failure;
}

}  // namespace Orvandeil::FileIO::embedded
