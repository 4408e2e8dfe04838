#include "tests/support/test_files.h"

#include "tests/support/printing.h"

#include <algorithm>
#include <cerrno>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <unistd.h>

#include <sys/mman.h>

namespace support {
namespace {

// How many of so many bytes may pass; 0, errno being set, when the call is to fail.
std::size_t allowed(FaultyFile& file, Call call, std::size_t count) {
    if (file.allow != nullptr) return file.allow(file, call, count);
    int& calls = call == Call::Read ? file.reads : call == Call::Write ? file.writes : file.seeks;
    const int failing = call == Call::Read    ? file.failingRead
                        : call == Call::Write ? file.failingWrite
                        : call == Call::Seek  ? file.failingSeek
                                              : 0;
    if (++calls < failing || failing == 0) return count;
    errno = file.error;
    return 0;
}

ssize_t readBytes(void* cookie, char* buffer, std::size_t size) {
    auto& file = *static_cast<FaultyFile*>(cookie);
    const std::size_t count = allowed(file, Call::Read, size);
    if (count == 0 && size != 0) return -1;
    const std::size_t start = std::min(file.offset, file.bytes.size());
    file.offset = start + file.bytes.copy(buffer, count, start);
    return static_cast<ssize_t>(file.offset - start);
}

ssize_t writeBytes(void* cookie, const char* buffer, std::size_t size) {
    return static_cast<ssize_t>(static_cast<FaultyFile*>(cookie)->put({buffer, size}));
}

int seek(void* cookie, off64_t* offset, int whence) {
    auto& file = *static_cast<FaultyFile*>(cookie);
    if (allowed(file, Call::Seek, 1) == 0) return -1;
    const std::size_t origins[] = {0, file.offset, file.bytes.size()};
    static_assert(SEEK_SET == 0 && SEEK_CUR == 1 && SEEK_END == 2);
    *offset += static_cast<off64_t>(origins[whence]);
    if (*offset < 0) {
        errno = EINVAL;
        return -1;
    }
    file.offset = static_cast<std::size_t>(*offset);
    return 0;
}

int closeFile(void* cookie) {
    return allowed(*static_cast<FaultyFile*>(cookie), Call::Close, 1) == 0 ? -1 : 0;
}

std::string contentOf(const std::string& path) {
    std::ifstream file(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), {}};
}

}  // namespace

TempFile::TempFile(std::string_view content) {
    filePath = std::filesystem::temp_directory_path() / "fileio_test_XXXXXX";
    close(mkstemp(filePath.data()));
    std::ofstream(filePath, std::ios::binary) << content;
}

std::string TempFile::content() const {
    return contentOf(filePath);
}

MemoryFile::MemoryFile(std::string_view content) : descriptor(memfd_create("test", MFD_CLOEXEC)) {
    std::ofstream(path(), std::ios::binary) << content;
}

MemoryFile::~MemoryFile() {
    close(descriptor);
}

std::string MemoryFile::content() const {
    return contentOf(path());
}

OpenedFile::OpenedFile(const std::string& path, const char* mode, const std::string& encoding)
    : StreamOver(
          std::fopen(path.c_str(), Orvandeil::FileIO::FilePermission(mode, false).fileSystemFormat),
          mode, encoding, fileio_tests::toUtf16(path)) {}

std::string OpenedFile::read(unsigned long count) {
    std::string bytes;
    char byte = 0;
    while (bytes.size() < count && stream.GetNElements(1, &byte, 1) == 1)
        bytes += byte;
    return bytes;
}

long OpenedFile::position() {
    long position = -1;
    stream.getPosition(position);
    return position;
}

std::size_t FaultyFile::put(std::string_view text) {
    const std::size_t count = allowed(*this, Call::Write, text.size());
    if (count == 0) return 0;
    if (appends) offset = bytes.size();
    bytes.resize(std::max(bytes.size(), offset + count));
    bytes.replace(offset, count, text.data(), count);
    offset += count;
    return count;
}

std::FILE* FaultyFile::open(const char* mode, std::size_t bufferSize) {
    std::FILE* const file = fopencookie(this, mode, {readBytes, writeBytes, seek, closeFile});
    buffer.resize(bufferSize);
    std::setvbuf(file, buffer.data(), bufferSize == 0 ? _IONBF : _IOFBF, bufferSize);
    return file;
}

}  // namespace support
