#pragma once

#include "fileio/export.h"
#include "fileio/host/console.h"

#include <string_view>
#include <vector>

// What the embedded host adds to its console: other places for its text to go to.
namespace Orvandeil::FileIO::embedded {

// Where the text of a console sink ends up, in UTF-8. The console's own targets are the standard
// output and the standard error of the process.
class FILEIO_API ConsoleTarget {
public:
    virtual ~ConsoleTarget();
    // False on failure, which sets the sink's bad bit.
    virtual bool write(std::string_view bytes) = 0;
    virtual bool flush() = 0;
};

}  // namespace Orvandeil::FileIO::embedded

// A sink of the embedded host. Text and numbers go straight on to the target; only a high surrogate
// that ends a text waits for what comes next.
struct FILEIO_API vxConsoleSink {
    explicit vxConsoleSink(Orvandeil::FileIO::embedded::ConsoleTarget& place) : target(&place) {}
    ~vxConsoleSink();
    vxConsoleSink(const vxConsoleSink&) = delete;
    vxConsoleSink& operator=(const vxConsoleSink&) = delete;

    void writeText(const char16_t* text, std::size_t units);
    void writeBytes(std::string_view bytes);
    void flush();
    // Writes a surrogate that still waits as U+FFFD.
    void endText();
    // Where writes to this sink really go: the newest redirection, or this.
    vxConsoleSink& destination();
    const vxConsoleSink& destination() const;

    Orvandeil::FileIO::embedded::ConsoleTarget* target;
    char16_t highSurrogate = 0;  // 0: none waits
    bool bad = false;
    bool throwsWhenBad = false;
    std::vector<boost::shared_ptr<vxConsoleSink>> redirections;
};

namespace Orvandeil::FileIO::embedded {

// While it lives, the sink writes to another target, and is good and throws nothing at first. Then
// everything is as it was. They nest.
class FILEIO_API ConsoleReplacement {
public:
    ConsoleReplacement(const boost::shared_ptr<vxConsoleSink>& replacedSink, ConsoleTarget& target);
    ~ConsoleReplacement();
    ConsoleReplacement(const ConsoleReplacement&) = delete;
    ConsoleReplacement& operator=(const ConsoleReplacement&) = delete;

private:
    boost::shared_ptr<vxConsoleSink> sink;
    ConsoleTarget* oldTarget;
    bool oldBad;
    bool oldThrowsWhenBad;
};

}  // namespace Orvandeil::FileIO::embedded
