#pragma once

#include "embedded/services/console.h"
#include "tests/support/test_files.h"

#include <cstddef>
#include <string>

// Faults in what a program asks of its host and of the system, at a call of one's choice. The
// program that includes this replaces the global operator new, and fstat.
namespace faults {

using support::Call;

struct Fault {
    Call call;
    int error;     // 0 with reads and writes: they do a part of their work
    bool onwards;  // every later call, too
    const char* name;
};

// While it lives, the n-th such call (counted from 1) fails.
class Injection {
public:
    Injection(const Fault& fault, std::size_t nth);
    ~Injection();
    Injection(const Injection&) = delete;
    Injection& operator=(const Injection&) = delete;

    static bool happened();
};

// While it lives, nothing fails and nothing is counted: for the test's own work.
class Pause {
public:
    Pause();
    ~Pause();
    Pause(const Pause&) = delete;
    Pause& operator=(const Pause&) = delete;
};

// Blocks of operator new that were not yet given back.
std::size_t liveObjectCount();

// A file in memory and a place for a console's text, subject to injections. Where fstat is asked
// about a file without a descriptor, it tells the size of the newest one.
struct Disk : support::FaultyFile, Orvandeil::FileIO::embedded::ConsoleTarget {
    explicit Disk(std::string_view content);
    ~Disk() override;

    std::FILE* open(const char* mode);
    bool write(std::string_view text) override { return put(text) == text.size(); }
    bool flush() override { return true; }

    bool seekable = true;
};

}  // namespace faults
