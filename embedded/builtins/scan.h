#pragma once

#include "embedded/builtins/open_file.h"
#include "embedded/services/array.h"
#include "fileio/attributes/size_attribute.h"

#include <optional>
#include <string>

namespace Orvandeil::FileIO::embedded {

struct ScanResult {
    // A column, or a row of characters; M rows filled column by column for a size of [M N] or
    // [M Inf], the last column padded with zeros. 0 by 0 when nothing was stored.
    ArrayPtr array;
    unsigned long count = 0;         // values stored; a word or a run of characters is one
    int code = 0;                    // the status that ended the scan
    std::optional<Failure> failure;  // that status unless it is a quiet end
    std::optional<long> position;    // where the next scan begins; none where a file has none
};

// Both scans run a valid size's number of values, or to the end of the data. The end of the data
// (0) and input that does not match (-9, and -1 while the file has no error) are quiet ends; values
// stored before any other end are delivered too. A read that failed is told as such, whatever
// conversion met it, and a field too long for the memory by -11.

// Reads from the current position; positions are bytes from the beginning of the file. CodeError
// -5, -31 and -33 when nothing can be read at all.
ScanResult scan(OpenFile& file, const std::u16string& format, const SizeAttribute& size);

// Reads the text as bytes of the encoding (UTF-8 when it is empty); positions are UTF-16 units.
ScanResult scanText(const std::u16string& text, const std::string& encoding,
                    const std::u16string& format, const SizeAttribute& size);

}  // namespace Orvandeil::FileIO::embedded
