#pragma once

#include <cstddef>
#include <optional>
#include <span>
#include <string_view>
#include <vector>

namespace cli {

// One option of a verb. Parsing and --help both come from tables of these.
struct Option {
    const char* name;       // without the dashes
    char shortName;         // 0: none
    const char* valueName;  // null: the option takes no value
    const char* help;
};

// The arguments of one verb, sorted into options and operands. The texts belong to argv.
//
// An argument is an option when it begins with "--" and a letter, or when it is exactly a known
// short option. Everything else is an operand, so that `-2.5`, `-Inf`, `-%d-` and `-` arrive as
// they stand. The value of an option is the next argument whatever it looks like, or follows `=`.
// Options may stand anywhere; `--` ends them. A long name may be abbreviated as long as it stays
// unambiguous; of a repeated option the last value counts.
class CommandLine {
public:
    // Throws UsageError for an unknown option or a value that is missing or out of place.
    CommandLine(std::span<const Option> options, std::span<char* const> arguments);

    bool has(std::string_view name) const { return value(name).has_value(); }
    // An option without a value of its own has the empty text.
    std::optional<std::string_view> value(std::string_view name) const;
    std::string_view valueOr(std::string_view name, std::string_view otherwise) const;
    const std::vector<std::string_view>& operands() const { return positional; }

private:
    struct Given {
        const Option* option;
        std::string_view value;
    };

    // Reads the option at `arguments[0]`; the number of arguments it took.
    std::size_t readOption(std::span<const Option> options, std::span<char* const> arguments);

    std::vector<Given> given;
    std::vector<std::string_view> positional;
};

}  // namespace cli
