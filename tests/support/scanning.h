#pragma once

#include "fileio/buffers/output_buffer.h"
#include "fileio/text/tcodn_stream.h"

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
    // Pieces run, the next one, and whether the format came round.
    unsigned long conversions = 0, nextIndex = 0;
    bool isRecycled = false;

    // "1 2 #2 =0 @3": values, count, code, position.
    std::string summary() const;
};

// Scans by `format` (UTF-8, as it stands) up to `limit` values, into chunks of so many at least.
Scanned scan(Orvandeil::FileIO::TcodnStream& stream, std::string_view format, long limit,
             std::size_t chunk = 4);

// The same over a file, with a read-ahead of a few bytes, and over a text in memory.
Scanned scanFile(std::string_view input, std::string_view format, long limit);
Scanned scanText(std::string_view input, std::string_view format, long limit);

}  // namespace support
