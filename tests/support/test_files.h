#pragma once

#include "fileio/attributes/file_permission.h"
#include "fileio/streams/file_stream.h"

#include <cstdio>
#include <string>
#include <string_view>

// Files for tests of streams: real ones, and files whose operations can be made to fail.
namespace support {

// A file of its own, removed at the end.
class TempFile {
public:
    explicit TempFile(std::string_view content = {});
    ~TempFile() { std::remove(filePath.c_str()); }
    TempFile(const TempFile&) = delete;
    TempFile& operator=(const TempFile&) = delete;

    const std::string& path() const { return filePath; }
    std::string content() const;

private:
    std::string filePath;
};

// A file of its own in memory, which goes by a path.
class MemoryFile {
public:
    explicit MemoryFile(std::string_view content);
    ~MemoryFile();
    MemoryFile(const MemoryFile&) = delete;
    MemoryFile& operator=(const MemoryFile&) = delete;

    std::string path() const { return "/proc/self/fd/" + std::to_string(descriptor); }
    std::string content() const;

private:
    int descriptor;
};

// A stream of a class that the library does not know, so that it is used in the plainest way.
template <class Stream>
struct Unknown : Stream {
    using Stream::Stream;
};

// A stream over a file, which it takes over.
template <class Stream>
struct StreamOver {
    StreamOver(std::FILE* openFile, const char* mode, const std::string& encoding = "",
               const std::u16string& name = u"")
        : permission(mode, false), file(openFile), stream(file, encoding, permission, name) {}
    ~StreamOver() { std::fclose(file); }

    Orvandeil::FileIO::FilePermission permission;
    std::FILE* file;
    Stream stream;
};

struct OpenedFile : StreamOver<Orvandeil::FileIO::fileStream> {
    using StreamOver::StreamOver;
    explicit OpenedFile(const std::string& path, const char* mode = "r",
                        const std::string& encoding = "");

    // Reads up to `count` bytes one by one.
    std::string read(unsigned long count);
    long position();
};

// What a program asks of the system and of its host.
enum class Call { Read, Write, Seek, Close, Stat, Memory, HostMemory };

// A file in memory. From a given call on (counted from 1, 0 is never), its reads, writes or seeks
// fail with `error`, which may be 0.
struct FaultyFile {
    // The standard library keeps `bufferSize` bytes, or none.
    std::FILE* open(const char* mode, std::size_t bufferSize = 0);
    // What a write does; the bytes written.
    std::size_t put(std::string_view text);

    std::string bytes;
    std::size_t offset = 0;
    int failingRead = 0, failingWrite = 0, failingSeek = 0;
    int error = 0;
    int reads = 0, writes = 0, seeks = 0;
    bool appends = false;
    std::string buffer = {};
    // If there is one, it decides instead: how many of so many bytes may pass. 0 is a failure.
    std::size_t (*allow)(const FaultyFile& file, Call call, std::size_t count) = nullptr;
};

}  // namespace support
