#pragma once

#include "embedded/services/array.h"
#include "fileio/text/output_string_stream.h"

#include <string>
#include <string_view>
#include <vector>

// Formatted output into a string, for tests.
namespace fileio_tests {

using Orvandeil::FileIO::embedded::ArrayPtr;

// What was written to a string, which is empty then.
std::string taken(Orvandeil::FileIO::outputStringStream& stream);

struct Printed {
    std::string text;  // UTF-8; NUL as it is
    bool complete = false;
    int code = 0;

    // "text", and for a failure "text!code".
    std::string summary() const { return complete ? text : text + '!' + std::to_string(code); }
};

// Prints `format` (UTF-8, as it stands) over the arguments.
Printed print(std::string_view format, const std::vector<const vxArray*>& arguments);

template <class... Arrays>
Printed print(std::string_view format, const Arrays&... arrays) {
    return print(format, std::vector<const vxArray*>{arrays.get()...});
}

std::u16string toUtf16(std::string_view text);
std::string toUtf8(std::u16string_view text);

}  // namespace fileio_tests
