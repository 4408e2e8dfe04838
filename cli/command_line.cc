#include "cli/command_line.h"

#include "cli/suggestion.h"
#include "cli/usage_error.h"

#include <algorithm>
#include <array>
#include <cctype>
#include <getopt.h>
#include <string>

namespace cli {
namespace {

// Values that getopt_long returns for the long form of option i, clear of any character.
constexpr int firstLongValue = 256;

bool looksLikeLongOption(std::string_view argument) {
    return argument.size() > 2 && argument.starts_with("--") &&
           std::isalpha(static_cast<unsigned char>(argument[2]));
}

bool isOption(std::span<const Option> options, std::string_view argument) {
    if (looksLikeLongOption(argument)) return true;
    return argument.size() == 2 && argument[0] == '-' &&
           std::ranges::any_of(options, [argument](const Option& option) {
               return option.shortName != 0 && option.shortName == argument[1];
           });
}

std::vector<option> longOptions(std::span<const Option> options) {
    std::vector<option> table;
    for (std::size_t i = 0; i < options.size(); ++i) {
        table.push_back({options[i].name, options[i].valueName ? required_argument : no_argument,
                         nullptr, firstLongValue + static_cast<int>(i)});
    }
    table.push_back({nullptr, 0, nullptr, 0});
    return table;
}

// "+": operands are not moved about; ":": a missing value is told apart from an unknown option.
std::string shortOptions(std::span<const Option> options) {
    std::string letters = "+:";
    for (const Option& option : options) {
        if (option.shortName == 0) continue;
        letters += option.shortName;
        if (option.valueName) letters += ':';
    }
    return letters;
}

const Option& findOption(std::span<const Option> options, int value) {
    if (value >= firstLongValue) return options[static_cast<std::size_t>(value - firstLongValue)];
    return *std::ranges::find(options, static_cast<char>(value), &Option::shortName);
}

[[noreturn]] void refuse(std::span<const Option> options, std::string_view argument) {
    const std::string_view name = argument.substr(0, argument.find('='));
    std::vector<std::string> dashed;
    for (const Option& option : options)
        dashed.push_back(std::string("--") + option.name);
    const std::vector<std::string_view> names(dashed.begin(), dashed.end());
    const auto matches =
        std::ranges::count_if(names, [name](auto known) { return known.starts_with(name); });
    if (matches > 1) throw UsageError("option \"" + std::string(name) + "\" is ambiguous");
    if (matches == 1) throw UsageError("option \"" + std::string(name) + "\" takes no value");
    throw UsageError(unknownName("option", name, names));
}

}  // namespace

CommandLine::CommandLine(std::span<const Option> options, std::span<char* const> arguments) {
    bool optionsEnded = false;
    while (!arguments.empty()) {
        const std::string_view argument = arguments[0];
        std::size_t taken = 1;
        if (!optionsEnded && argument == "--") {
            optionsEnded = true;
        } else if (!optionsEnded && isOption(options, argument)) {
            taken = readOption(options, arguments);
        } else {
            positional.push_back(argument);
        }
        arguments = arguments.subspan(taken);
    }
}

std::size_t CommandLine::readOption(std::span<const Option> options,
                                    std::span<char* const> arguments) {
    char program[] = "fileio";
    std::array<char*, 4> pair = {program, arguments[0],
                                 arguments.size() > 1 ? arguments[1] : nullptr, nullptr};
    optind = 0;  // starts getopt_long afresh
    opterr = 0;
    const int found =
        getopt_long(arguments.size() > 1 ? 3 : 2, pair.data(), shortOptions(options).c_str(),
                    longOptions(options).data(), nullptr);
    if (found == ':') {
        throw UsageError("option \"" + std::string(arguments[0]) + "\" needs a value");
    }
    if (found == '?') refuse(options, arguments[0]);
    const Option& option = findOption(options, found);
    given.push_back({&option, option.valueName ? optarg : std::string_view()});
    return static_cast<std::size_t>(optind) - 1;
}

std::optional<std::string_view> CommandLine::value(std::string_view name) const {
    const auto last = std::find_if(given.rbegin(), given.rend(),
                                   [name](const Given& one) { return one.option->name == name; });
    if (last == given.rend()) return std::nullopt;
    return last->value;
}

std::string_view CommandLine::valueOr(std::string_view name, std::string_view otherwise) const {
    return value(name).value_or(otherwise);
}

}  // namespace cli
