#pragma once

#include <memory>

#include <unicode/ucnv.h>

namespace Orvandeil::FileIO::detail {

struct CloseConverter {
    void operator()(UConverter* converter) const { ucnv_close(converter); }
};
using OwnedConverter = std::unique_ptr<UConverter, CloseConverter>;

}  // namespace Orvandeil::FileIO::detail
