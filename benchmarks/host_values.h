#pragma once

#include "benchmarks/job.h"
#include "embedded/services/array.h"
#include "fileio/buffers/host_block.h"

#include <span>
#include <string>
#include <string_view>

// What several families of jobs do with the library.
namespace bench {

using Orvandeil::FileIO::embedded::ArrayPtr;

// A block of UTF-16.
struct Printed {
    Orvandeil::FileIO::detail::HostBytes block;
    std::size_t units = 0;

    std::u16string_view text() const {
        return {reinterpret_cast<const char16_t*>(block.get()), units};
    }
};

// Prints the arrays into a new block; the array of their addresses is not changed.
Printed printed(const std::u16string& format, std::span<const vxArray*> arrays);
void printToBlock(Trial& trial, const std::u16string& format,
                  std::span<const vxArray* const> arrays);

// Scans text of UTF-8 in memory into a new array.
ArrayPtr scanned(const std::string& text, const std::u16string& format);
void scanBytes(Trial& trial, const std::string& text, const std::u16string& format);

// The real parts of an array, as bytes, or as text when it is of class char.
void resultOfArray(Trial& trial, const vxArray& array);

}  // namespace bench
