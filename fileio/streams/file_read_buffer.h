#pragma once

#include <cstdio>
#include <string_view>

// What the C library has read ahead of a file, for parsing in place. Only this file knows how the
// library keeps it.
namespace Orvandeil::FileIO::detail {

#ifdef __GLIBC__

// The bytes that getc would bring next without another read; none behind the end of the file.
// Valid up to the next operation on the file.
inline std::string_view bytesReadAhead(std::FILE* file) {
    // Giving a byte back would clear the indicator, which nothing else here does.
    if (feof_unlocked(file) != 0) return {};
    return {file->_IO_read_ptr, static_cast<std::size_t>(file->_IO_read_end - file->_IO_read_ptr)};
}

// Takes the bytes before `next`, which lies in those read ahead or behind the last of them.
inline void takeReadAhead(std::FILE* file, const char* next) {
    file->_IO_read_ptr += next - file->_IO_read_ptr;
}

#else

// Without that knowledge there is nothing ahead: everything goes through getc and ungetc.
inline std::string_view bytesReadAhead(std::FILE*) {
    return {};
}
inline void takeReadAhead(std::FILE*, const char*) {}

#endif

}  // namespace Orvandeil::FileIO::detail
