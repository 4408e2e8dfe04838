#pragma once

#include <concepts>
#include <string_view>

namespace cli {

// Both read one element that realLength() of value_literal.h accepts, and all of it.

// The nearest value of the type.
template <std::floating_point T>
T readFloating(std::string_view element);

// The nearest whole number in [lowest, highest], decided on the decimal digits themselves: halves
// go away from zero, what lies outside saturates, NaN gives 0.
template <std::integral T>
T readWhole(std::string_view element, T lowest, T highest);

}  // namespace cli
