#include "tests/support/memory_file.h"

#include <algorithm>
#include <cerrno>
#include <utility>

namespace support {

MemoryFile::MemoryFile(std::string content, Kind kind, std::size_t bufferSize)
    : bytes(std::move(content)), buffer(std::max<std::size_t>(bufferSize, 1), '\0') {
    const auto seeker = kind == Seekable ? seek : refuseToSeek;
    const cookie_io_functions_t calls = {read, nullptr, seeker, nullptr};
    file = fopencookie(this, "r", calls);
    std::setvbuf(file, buffer.data(), _IOFBF, buffer.size());
}

MemoryFile::~MemoryFile() {
    std::fclose(file);
}

ssize_t MemoryFile::read(void* self, char* target, std::size_t size) {
    auto& it = *static_cast<MemoryFile*>(self);
    const std::size_t count = it.bytes.copy(target, size, it.offset);
    it.offset += count;
    return static_cast<ssize_t>(count);
}

int MemoryFile::seek(void* self, off64_t* position, int whence) {
    auto& it = *static_cast<MemoryFile*>(self);
    const std::size_t base = whence == SEEK_SET   ? 0
                             : whence == SEEK_CUR ? it.offset
                                                  : it.bytes.size();
    const off64_t target = static_cast<off64_t>(base) + *position;
    if (target < 0 || target > static_cast<off64_t>(it.bytes.size())) return -1;
    *position = target;
    it.offset = static_cast<std::size_t>(target);
    return 0;
}

int MemoryFile::refuseToSeek(void*, off64_t*, int) {
    errno = ESPIPE;
    return -1;
}

std::string readRest(std::FILE* file) {
    std::string rest;
    for (int byte = std::getc(file); byte != EOF; byte = std::getc(file))
        rest += static_cast<char>(byte);
    return rest;
}

}  // namespace support
