#pragma once

#include "fileio/export.h"
#include "fileio/host/messages.h"

#include <string>
#include <string_view>
#include <vector>

// What the embedded host adds to its messages: the recording of warnings, and a view of its
// catalog.
namespace Orvandeil::FileIO::embedded {

// While it lives, warnings are kept here in order instead of being printed to standard error. The
// newest one takes them; the one before it goes on afterwards.
class FILEIO_API WarningRecorder {
public:
    WarningRecorder();
    ~WarningRecorder();
    WarningRecorder(const WarningRecorder&) = delete;
    WarningRecorder& operator=(const WarningRecorder&) = delete;

    const std::vector<foundation::core::except::BaseMsgID>& warnings() const { return recorded; }
    std::vector<std::string> identifiers() const;
    void record(const foundation::core::except::BaseMsgID& id) { recorded.push_back(id); }

private:
    WarningRecorder* outer;
    std::vector<foundation::core::except::BaseMsgID> recorded;
};

// The catalog's sentence for an identifier, {0}, {1} … standing for its arguments; empty when the
// catalog has none.
FILEIO_API std::string_view catalogSentence(std::string_view identifier);

}  // namespace Orvandeil::FileIO::embedded
