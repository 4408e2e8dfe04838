#pragma once

#include "fileio/export.h"

#include <string>

namespace Orvandeil::FileIO::embedded {

// While it lives, the host does not support the encoding of that canonical name, although its
// converters know it. They nest.
class FILEIO_API WithdrawnEncoding {
public:
    explicit WithdrawnEncoding(std::string canonicalName);
    ~WithdrawnEncoding();
    WithdrawnEncoding(const WithdrawnEncoding&) = delete;
    WithdrawnEncoding& operator=(const WithdrawnEncoding&) = delete;
};

}  // namespace Orvandeil::FileIO::embedded
