#include "cli/help.h"

#include <algorithm>

namespace cli {
namespace {

// `-o, --output FILE`
std::string optionForms(const Option& option) {
    std::string forms = option.shortName != 0 ? std::string("-") + option.shortName + ", " : "";
    forms += std::string("--") + option.name;
    if (option.valueName) forms += std::string(" ") + option.valueName;
    return forms;
}

std::string padded(std::string text, std::size_t width) {
    text.resize(std::max(width, text.size()), ' ');
    return text;
}

std::string optionLines(const std::vector<Option>& options) {
    std::size_t width = 0;
    for (const Option& option : options)
        width = std::max(width, optionForms(option).size());
    std::string lines;
    for (const Option& option : options)
        lines += "  " + padded(optionForms(option), width) + "  " + option.help + '\n';
    return lines;
}

constexpr char valueHelp[] = R"(
A VALUE is written as
  3  -2.5  1e3  Inf  NaN       a double
  [1 2 3; 4 5 6]               a double matrix
  CLASS:3  CLASS:[1 2]         the same in another class; CLASS is logical, char, int8 to int64,
                               uint8 to uint64, single or double
  complex:[1+2i 3]             complex doubles
  'any text'                   a char row
  string:any text              a string; string:<missing> is a missing one
  @FILE.npy                    the array in a NumPy file
and anything else is a char row of the text itself.
An operand that begins with -- and a letter needs a -- of its own in front of it.
)";

}  // namespace

std::string programHelp() {
    std::string help =
        "usage: fileio VERB [options] ...\n\n"
        "Formatted and binary input and output of numeric arrays.\n\n";
    for (const Verb* verb : allVerbs())
        help += "  " + padded(verb->name, 8) + "  " + verb->summary + '\n';
    help +=
        "\n  fileio VERB --help  shows the options of a verb\n"
        "  fileio --version    shows the version\n";
    return help + valueHelp +
           "\nExit status: 0 done, 1 the library reported an error, 2 the command line is wrong.\n";
}

std::string verbHelp(const Verb& verb) {
    std::string help =
        std::string("usage: fileio ") + verb.name + " [options] " + verb.operands + "\n\n";
    help += std::string(verb.summary) + "\n\n";
    help += optionLines(optionsOf(verb));
    if (verb.details[0] != '\0') help += std::string("\n") + verb.details;
    return help;
}

std::string versionText() {
    return "fileio " FILEIO_VERSION "\n";
}

}  // namespace cli
