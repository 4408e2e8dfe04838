#include "cli/suggestion.h"

#include <algorithm>
#include <cctype>
#include <vector>

namespace cli {
namespace {

// A third of the letters may be wrong, and one in short names.
bool isNear(std::size_t distance, std::string_view name) {
    return distance <= std::max<std::size_t>(1, name.size() / 3);
}

std::string lowerCase(std::string_view name) {
    std::string lower(name);
    std::ranges::transform(lower, lower.begin(), [](unsigned char letter) {
        return static_cast<char>(std::tolower(letter));
    });
    return lower;
}

std::string listed(std::span<const std::string_view> names) {
    std::string list;
    for (const std::string_view name : names) {
        if (!list.empty()) list += ", ";
        list += name;
    }
    return list;
}

}  // namespace

std::size_t editDistance(std::string_view from, std::string_view to) {
    std::vector<std::size_t> beforeLast(to.size() + 1);
    std::vector<std::size_t> last(to.size() + 1);
    std::vector<std::size_t> row(to.size() + 1);
    for (std::size_t j = 0; j <= to.size(); ++j)
        row[j] = j;
    for (std::size_t i = 1; i <= from.size(); ++i) {
        beforeLast.swap(last);
        last.swap(row);
        row[0] = i;
        for (std::size_t j = 1; j <= to.size(); ++j) {
            const std::size_t replaced = last[j - 1] + (from[i - 1] == to[j - 1] ? 0 : 1);
            row[j] = std::min({replaced, last[j] + 1, row[j - 1] + 1});
            const bool swapped =
                i > 1 && j > 1 && from[i - 1] == to[j - 2] && from[i - 2] == to[j - 1];
            if (swapped) row[j] = std::min(row[j], beforeLast[j - 2] + 1);
        }
    }
    return row[to.size()];
}

std::string unknownName(std::string_view kind, std::string_view given,
                        std::span<const std::string_view> names) {
    std::string message = "unknown " + std::string(kind) + " \"" + std::string(given) + '"';
    const auto distance = [given](std::string_view name) {
        return editDistance(lowerCase(given), lowerCase(name));
    };
    const auto nearest = std::ranges::min_element(names, {}, distance);
    if (nearest != names.end() && isNear(distance(*nearest), *nearest)) {
        return message + "; did you mean \"" + std::string(*nearest) + "\"?";
    }
    return message + "; there are " + listed(names);
}

}  // namespace cli
