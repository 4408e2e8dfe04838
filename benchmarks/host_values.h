#pragma once

#include "benchmarks/job.h"
#include "embedded/services/array.h"

#include <span>
#include <string>

// What several families of jobs do with the library.
namespace bench {

using Orvandeil::FileIO::embedded::ArrayPtr;

// Prints the arrays into a new UTF-16 block.
void printToBlock(Trial& trial, const std::u16string& format,
                  std::span<const vxArray* const> arrays);

// Scans text of UTF-8 in memory into a new array.
void scanBytes(Trial& trial, const std::string& text, const std::u16string& format);

// The real parts of an array, as bytes, or as text when it is of class char.
void resultOfArray(Trial& trial, const vxArray& array);

}  // namespace bench
