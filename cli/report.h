#pragma once

#include "cli/json_writer.h"
#include "embedded/services/messages.h"
#include "fileio/host/exception.h"

#include <optional>
#include <string>
#include <string_view>

namespace cli {

inline constexpr int exitDone = 0;
inline constexpr int exitFailed = 1;
inline constexpr int exitUsage = 2;

// Everything a verb tells: its output, its error and the exit code. In plain mode output goes out
// as it comes and warnings are printed at once. In JSON mode both go into the one object that
// finish() ends; an error is one line on standard error in either mode.
class Report {
public:
    explicit Report(bool json);

    bool isJson() const { return recorder.has_value(); }

    // JSON mode: the object, for the verb's own keys.
    JsonWriter& object() { return json; }
    template <class T>
    void key(std::string_view name, const T& value) {
        json.key(name).value(value);
    }

    // Plain mode: standard output. A failure is told by finish().
    void print(std::string_view bytes);

    // The call failed with a numeric code; `place` says where in the user's text (may be empty).
    void fail(int code, std::string_view place = {});
    // The call failed with an identifier that has no code.
    void fail(const foundation::core::except::IMsgIDException& error, std::string_view place = {});
    // The call ended for want of memory, perhaps within a key: the verb's keys are given up, unless
    // a part of them has been printed.
    void failExhausted();
    // A code that ended the call without being an error.
    void note(int code);
    // The identifier that is the answer itself.
    void setIdentifier(std::string name) { identifier = std::move(name); }

    // Ends the output; the exit code.
    int finish();

private:
    void flush();
    void tell(std::string_view message, std::string_view place);

    JsonWriter json;
    std::optional<Orvandeil::FileIO::embedded::WarningRecorder> recorder;
    int outputError = 0;  // errno of the first failed write
    bool failed = false;
    int code = 0;
    std::string identifier;
};

// The identifier and the message that a numeric code is raised with.
struct CodeText {
    std::string identifier;
    std::string message;
};
CodeText describeCode(int code);

// One line on standard error, `fileio: ` before it; control characters become blanks.
void printErrorLine(std::string_view text);

}  // namespace cli
