#pragma once

#include "fileio/host/arrays.h"

#include <memory>

namespace Orvandeil::FileIO::detail {

struct DestroyArray {
    void operator()(vxArray* array) const noexcept { vxArrayDestroy(array); }
};

// A host array that ends with its scope.
using HostArray = std::unique_ptr<vxArray, DestroyArray>;

}  // namespace Orvandeil::FileIO::detail
