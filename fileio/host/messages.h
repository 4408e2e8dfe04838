#pragma once

#include "fileio/export.h"
#include "fileio/host/exception.h"
#include "fileio/host/message_id.h"

#include <string>

#include <boost/exception_ptr.hpp>

// Errors and warnings of the host. Texts live in its catalog, never in the library.

// The catalog's text for an identifier, filled with its arguments.
FILEIO_API std::u16string vxMessageText(const foundation::core::except::BaseMsgID& id);

// The host's error path. It normally unwinds into the host and does not return; when it returns,
// the caller throws the exception itself.
FILEIO_API void vxErrorHandOff(const foundation::core::except::IMsgIDException& error);

// Raises the host's legacy error of that number. Does not return.
[[noreturn]] FILEIO_API void vxErrorByNumber(int number);

// Raises again an error that was stored. Does not return; each call raises a copy of its own.
[[noreturn]] FILEIO_API void vxErrorRethrow(const boost::exception_ptr& error);

// Issues a warning and returns; what was going on continues.
FILEIO_API void vxWarningMsgId(const foundation::core::except::BaseMsgID& id);

// Raises an identifier as an error: Exception<Id> over a copy of `id`. Does not return.
template <class Id>
[[noreturn]] void vxErrMsgId(const Id& id) {
    const foundation::core::except::Exception<Id, std::exception> error(id);
    vxErrorHandOff(error);
    throw error;
}

// The same under another identifier text ("KESTRA:UnableToConvert"); the message text still comes
// from `id`.
template <class Id>
[[noreturn]] void vxErrMsgId(const std::string& raisedAs, const Id& id) {
    const foundation::core::except::Exception<Id, std::exception> error(id, raisedAs);
    vxErrorHandOff(error);
    throw error;
}
