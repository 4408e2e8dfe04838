#pragma once

#include "fileio/export.h"

#include <exception>

namespace Orvandeil::FileIO {

// More text at once than the converter library can take.
class FILEIO_API ConversionSizeError : public std::exception {
public:
    const char* what() const noexcept override {
        return "Data size too large for character code conversion.";
    }
    // Its number among the failures of character conversion.
    int kind() const noexcept { return 6; }
};

}  // namespace Orvandeil::FileIO
