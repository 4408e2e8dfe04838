#pragma once

#include "cli/command_line.h"
#include "cli/report.h"

#include <cstddef>
#include <span>

namespace cli {

// One verb of the program. A verb is one file that defines its Verb, and one line in verb_table.cc;
// parsing, --help and --json come from here.
struct Verb {
    const char* name;
    const char* operands;  // as shown in the usage line
    const char* summary;   // one line
    const char* details;   // further lines of help, each with its end; may be empty
    std::span<const Option> options;
    std::size_t leastOperands;
    std::size_t mostOperands;
    // Throws UsageError for a wrong command line; errors of the library pass through.
    void (*run)(const CommandLine& line, Report& report);
};

inline constexpr std::size_t anyNumber = static_cast<std::size_t>(-1);

extern const Verb printfVerb;
extern const Verb scanVerb;
extern const Verb readVerb;
extern const Verb writeVerb;
extern const Verb linesVerb;
extern const Verb charsetVerb;
extern const Verb convertVerb;
extern const Verb explainVerb;

std::span<const Verb* const> allVerbs();

// The verb's own options and those of every verb.
std::vector<Option> optionsOf(const Verb& verb);

}  // namespace cli
