#pragma once

#include "embedded/builtins/open_file.h"
#include "embedded/services/array.h"
#include "tests/faults/injection.h"

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

// Calls of all kinds over all kinds of streams, to be run under injections.
namespace faults {

namespace embedded = Orvandeil::FileIO::embedded;

// What a scenario works in, and what it has brought about.
class World {
public:
    // Opens `content` as a file in memory, whose stream has the encoding. A mode that ends in '|'
    // is a file that cannot seek.
    embedded::OpenFile& file(std::string mode, const char* encoding, std::string_view content);
    // The console or its error, by the number in a table; what is written there comes to the disk.
    embedded::OpenFile& console(int number);

    // Notes a part of the result.
    void note(std::string_view part);
    // Ends the scenario when there is a failure.
    static void check(const std::optional<embedded::Failure>& failure);
    // Flushes the open file, and then does with it what a user would do next, without faults.
    void settle();
    // Empty when the file is as usable as before.
    std::string nextCall();

    std::string values;
    std::string initial;  // content of the disk
    std::unique_ptr<Disk> disk;
    bool isConsole = false;

private:
    std::unique_ptr<embedded::ConsoleReplacement> replacement;
    std::unique_ptr<embedded::OpenFile> openFile;
};

struct Scenario {
    std::string name;
    std::function<void(World&)> run;
    // What memory faults may change without an error: the answer of a detection.
    bool mayFallBack = false;
};

std::vector<Scenario> everyScenario();

}  // namespace faults
