#include "cli/verb.h"

namespace cli {
namespace {

constexpr const Verb* verbs[] = {&printfVerb, &scanVerb,    &readVerb,    &writeVerb,
                                 &linesVerb,  &charsetVerb, &convertVerb, &explainVerb};

constexpr Option commonOptions[] = {
    {"json", 0, nullptr, "print one JSON object instead of the plain output"},
    {"help", 0, nullptr, "show this help"},
};

}  // namespace

std::span<const Verb* const> allVerbs() {
    return verbs;
}

std::vector<Option> optionsOf(const Verb& verb) {
    std::vector<Option> options(verb.options.begin(), verb.options.end());
    options.insert(options.end(), std::begin(commonOptions), std::end(commonOptions));
    return options;
}

}  // namespace cli
