#pragma once

#include "fileio/errors/identifiers.h"
#include "fileio/export.h"
#include "fileio/host/messages.h"
#include "fileio/memory_operation_overloads.h"

#include <string>

namespace Orvandeil::FileIO {

// The texts of attributes that were not given.
FILEIO_API inline constexpr const char* dfltPermValue = "r";
FILEIO_API inline constexpr const char* dfltAttrEmpty = "";
FILEIO_API inline constexpr const char* dfltPrecVal = "uchar";

// An argument of an open or a binary transfer that is a text. It is parsed when it is set, but an
// error is kept until Validate(), so that a caller can set all its attributes first and then
// validate them in its own order. `Error` is the identifier of a text that does not parse.
// The order of the virtual operations is part of the binary interface.
template <const char* const* defaultText, class Error>
class FILEIO_API CharAttrValidator : public fiMemoryOperationOverloads {
public:
    CharAttrValidator() = default;
    CharAttrValidator(const CharAttrValidator&) = default;
    CharAttrValidator& operator=(const CharAttrValidator&) = default;
    virtual ~CharAttrValidator() = default;

    // Raises the error of an invalid attribute; does nothing for a valid one.
    virtual void Validate() const {
        if (!valid) vxErrMsgId(Error());
    }

    // Parses a NUL-terminated text; whether it is a valid one. The caller stores that in `valid`.
    virtual bool Init(const char* newText) = 0;

    CharAttrValidator& operator=(const char* newText) {
        valid = Init(newText);
        return *this;
    }

    std::string text = *defaultText;
    bool valid = true;
};

}  // namespace Orvandeil::FileIO
