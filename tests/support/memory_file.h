#pragma once

#include <cstdio>
#include <string>

namespace support {

// Bytes in memory, opened for reading as a file. They end like a file's, or like a pipe's: then
// nothing can seek. The standard library reads `bufferSize` bytes ahead.
class MemoryFile {
public:
    enum Kind { Seekable, PipeLike };

    MemoryFile(std::string content, Kind kind, std::size_t bufferSize);
    ~MemoryFile();
    MemoryFile(const MemoryFile&) = delete;
    MemoryFile& operator=(const MemoryFile&) = delete;

    std::FILE* get() const { return file; }

private:
    static ssize_t read(void* self, char* buffer, std::size_t size);
    static int seek(void* self, off64_t* offset, int whence);
    static int refuseToSeek(void* self, off64_t* offset, int whence);

    std::string bytes;
    std::size_t offset = 0;
    std::string buffer;
    std::FILE* file;
};

// All that is left in a file.
std::string readRest(std::FILE* file);

}  // namespace support
