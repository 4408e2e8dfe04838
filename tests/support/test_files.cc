#include "tests/support/test_files.h"

#include "tests/support/printing.h"

#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <fstream>
#include <iterator>
#include <unistd.h>

namespace support {
namespace {

bool fails(int call, int failingCall, int error) {
    if (failingCall == 0 || call < failingCall) return false;
    errno = error;
    return true;
}

ssize_t readBytes(void* cookie, char* buffer, std::size_t size) {
    auto& file = *static_cast<FaultyFile*>(cookie);
    if (fails(++file.reads, file.failingRead, file.error)) return -1;
    const std::size_t start = std::min(file.offset, file.bytes.size());
    const std::size_t count = file.bytes.copy(buffer, size, start);
    file.offset = start + count;
    return static_cast<ssize_t>(count);
}

ssize_t writeBytes(void* cookie, const char* buffer, std::size_t size) {
    auto& file = *static_cast<FaultyFile*>(cookie);
    if (fails(++file.writes, file.failingWrite, file.error)) return 0;
    file.bytes.resize(std::max(file.bytes.size(), file.offset + size));
    file.bytes.replace(file.offset, size, buffer, size);
    file.offset += size;
    return static_cast<ssize_t>(size);
}

int seek(void* cookie, off64_t* offset, int whence) {
    auto& file = *static_cast<FaultyFile*>(cookie);
    if (fails(++file.seeks, file.failingSeek, file.error)) return -1;
    const std::size_t base = whence == SEEK_SET   ? 0
                             : whence == SEEK_CUR ? file.offset
                                                  : file.bytes.size();
    *offset += static_cast<off64_t>(base);
    if (*offset < 0) return -1;
    file.offset = static_cast<std::size_t>(*offset);
    return 0;
}

}  // namespace

TempFile::TempFile(std::string_view content) {
    const char* folder = std::getenv("TMPDIR");
    filePath = std::string(folder ? folder : "/tmp") + "/fileio_test_XXXXXX";
    close(mkstemp(filePath.data()));
    std::ofstream(filePath, std::ios::binary) << content;
}

TempFile::~TempFile() {
    unlink(filePath.c_str());
}

std::string TempFile::content() const {
    std::ifstream file(filePath, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), {}};
}

OpenedFile::OpenedFile(const std::string& path, const char* mode, const std::string& encoding)
    : permission(mode, false),
      file(std::fopen(path.c_str(), permission.fileSystemFormat)),
      stream(file, encoding, permission, fileio_tests::toUtf16(path)) {}

OpenedFile::OpenedFile(std::FILE* openFile, const char* mode, const std::string& encoding)
    : permission(mode, false), file(openFile), stream(file, encoding, permission, u"") {}

OpenedFile::~OpenedFile() {
    std::fclose(file);
}

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

std::FILE* FaultyFile::open(const char* mode) {
    std::FILE* const file = fopencookie(this, mode, {readBytes, writeBytes, seek, nullptr});
    std::setvbuf(file, nullptr, _IONBF, 0);
    return file;
}

}  // namespace support
