#pragma once

#include "fileio/text/output_string_stream.h"
#include "fileio/text/std_err_stream.h"

#include <typeinfo>

namespace Orvandeil::FileIO::detail {

// The stream when it is exactly one of that class, else null.
template <class Stream>
Stream* exactly(TcodnStream& out) {
    return typeid(out) == typeid(Stream) ? static_cast<Stream*>(&out) : nullptr;
}

// Whether the stream is exactly one of the library's own, so that how a text is cut into writes
// shows nowhere. A class derived from them may watch its writes.
inline bool isKnownStream(const TcodnStream& out) {
    const std::type_info& type = typeid(out);
    return type == typeid(outputStringStream) || type == typeid(fileStream) ||
           type == typeid(outputScreenStream) || type == typeid(stdErrStream);
}

}  // namespace Orvandeil::FileIO::detail
