#pragma once

#include "embedded/services/array.h"
#include "fileio/host/dispatch.h"
#include "fileio/host/message_id.h"

#include <span>
#include <string_view>

namespace Orvandeil::FileIO::embedded {

// "KESTRA:badsubscript", raised by "subsref" for an index that names no element.
class FILEIO_API BadSubscript : public foundation::core::except::BaseMsgID {
public:
    BadSubscript() : BaseMsgID("KESTRA", "badsubscript") {}
};

// vxDispatchCall in owning terms: the functions of an object made with its own table, or the
// host's by function and class name. Null: no such function applies.
FILEIO_API ArrayPtr callFunction(std::string_view name, std::span<const vxArray* const> inputs);

}  // namespace Orvandeil::FileIO::embedded
