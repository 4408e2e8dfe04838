#pragma once

#include "fileio/buffers/output_buffer.h"
#include "fileio/text/tcodn_stream.h"
#include "tests/support/test_files.h"

#include <cerrno>
#include <string>
#include <string_view>

// Formatted input, for tests.
namespace support {

constexpr long unlimited = -1;

struct Scanned {
    std::string values;  // numbers between blanks, or 'text'
    unsigned long count = 0;
    int code = 0;
    long position = 0;  // in bytes; -1 where the stream knows none
    bool result = false;

    // "1 2 #2 =0 @3": values, count, code, position.
    std::string summary() const;
};

// Scans by `format` (UTF-8, as it stands) up to `limit` values.
Scanned scan(Orvandeil::FileIO::TcodnStream& stream, std::string_view format, long limit);

// The same over a file, a file that cannot seek, and a text in memory; read-ahead of a few bytes.
Scanned scanBytes(FaultyFile file, std::string_view format, long limit);
inline Scanned scanFile(std::string_view input, std::string_view format, long limit) {
    return scanBytes({.bytes = std::string(input)}, format, limit);
}
inline Scanned scanPipe(std::string_view input, std::string_view format, long limit) {
    const std::string bytes(input);
    return scanBytes({.bytes = bytes, .failingSeek = 1, .error = ESPIPE}, format, limit);
}
Scanned scanText(std::string_view input, std::string_view format, long limit);

}  // namespace support
