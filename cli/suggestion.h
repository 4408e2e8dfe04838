#pragma once

#include <span>
#include <string>
#include <string_view>

namespace cli {

// The characters to insert, delete, replace or swap with a neighbour to turn one word into the
// other (optimal string alignment).
std::size_t editDistance(std::string_view from, std::string_view to);

// `unknown KIND "GIVEN"; did you mean "NAME"?`, with the nearest of the names. When none is near,
// all of them are listed.
std::string unknownName(std::string_view kind, std::string_view given,
                        std::span<const std::string_view> names);

}  // namespace cli
