#pragma once

#include "fileio/attributes/char_attr_validator.h"
#include "fileio/errors/stored_exception.h"

#include <boost/exception_ptr.hpp>

namespace Orvandeil::FileIO {

// How a file is to be opened: one of 'r', 'w', 'a' (with automatic flushing), 'W', 'A' (without),
// then any of '+' (update), 'b' and 't' (text mode), in any order and as often as one likes. A
// stream keeps a pointer to the permission it was opened with, so it must outlive the stream.
class FILEIO_API FilePermission
    : public CharAttrValidator<&dfltPermValue, KESTRA::legacy_two_part::badpermission_vx> {
public:
    // Reading, "r".
    FilePermission();
    FilePermission(const char* mode, bool constructionFlagValue);
    // Copies share the pending error.
    FilePermission(const FilePermission&) = default;
    FilePermission& operator=(const FilePermission&) = default;
    FilePermission& operator=(const char* mode);

    // Keeps what is wrong with `mode` as the pending error, to be raised by Validate:
    // "KESTRA:legacy_two_part:badpermission_vx" when it is empty or begins with no access letter,
    // "KESTRA:fopen:IncorrectFileMode" for a foreign letter, and, with the flags already changed,
    // "KESTRA:fopen:ConflictingExclusiveFileModes" unless one of reading, writing and appending
    // is asked for.
    bool Init(const char* mode) override;
    // Raises the pending error. It stays pending.
    void Validate() const override;

    // Makes `fileSystemFormat` from the flags and, in text mode, drops the first 't' from `text`:
    // each call drops one, so that only Init calls it, once.
    void generateFileSystemFormat();

    template <class E>
    void AssignError(const E& error) {
        pendingError = detail::storedException(error);
    }

    bool read = true;
    bool write = false;
    bool append = false;
    bool update = false;
    bool binary = false;
    bool textMode = false;
    bool autoFlush = true;
    bool constructionFlag = false;  // the opener's own; only kept

private:
    friend struct LayoutProbe;

    void setFlags();

    boost::exception_ptr pendingError;  // shared with copies; null when there is none

public:
    // The mode for fopen, always binary: text handling and flushing are the streams' own.
    char fileSystemFormat[4] = {};
};

}  // namespace Orvandeil::FileIO
