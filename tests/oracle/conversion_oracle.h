#pragma once

#include "fileio/buffers/convert_element.h"
#include "fileio/buffers/element_conversion.h"
#include "tests/properties/bytes.h"

#include <algorithm>
#include <cmath>
#include <cstring>
#include <limits>
#include <string>
#include <type_traits>
#include <vector>

// What element conversion has to give, computed in extended numbers, which hold every element of
// every class exactly.
namespace oracle {

template <class To>
long double expectedElement(long double value) {
    using namespace Orvandeil::FileIO::detail;
    if constexpr (std::is_floating_point_v<To>) return static_cast<To>(value);
    using Limits = std::numeric_limits<Number<To>>;
    const long double highest = std::is_same_v<To, Logical> ? 1 : Limits::max();
    if (std::isnan(value)) return 0;
    // The sum turns -0, which no integer is, into 0.
    return std::clamp(std::round(value), static_cast<long double>(Limits::min()), highest) + 0.L;
}

inline bool isSame(long double one, long double other) {
    if (std::isnan(one)) return std::isnan(other);
    return one == other && (one != 0 || std::signbit(one) == std::signbit(other));
}

// Converts with both blocks off any alignment, and compares every element. Elements of the same
// class keep their bits, elsewhere any logical byte but 0 is 1.
template <class To, class From>
void checkRun(vxClassID to, vxClassID from, const std::vector<From>& elements) {
    using namespace Orvandeil::FileIO;
    std::vector<char> source(1 + elements.size() * sizeof(From));
    if (!elements.empty()) std::memcpy(source.data() + 1, elements.data(), source.size() - 1);
    std::vector<char> target(2 + elements.size() * sizeof(To), 'x');
    const std::string pair = "class " + std::to_string(from) + " to " + std::to_string(to);
    const void* end =
        AssignToVoidBuffer(to, target.data() + 1, from, source.data() + 1, elements.size());
    if (end != &target.back() || target.back() != 'x') throw properties::Broken(pair + ": the end");
    if (to == from && !std::equal(source.begin() + 1, source.end(), target.begin() + 1))
        throw properties::Broken(pair + ": bits are lost");
    for (std::size_t i = 0; to != from && i < elements.size(); ++i) {
        auto value = static_cast<long double>(elements[i]);
        if (from == vxLOGICAL_CLASS) value = value != 0;
        const auto result = static_cast<long double>(detail::loadElement<To>(target.data() + 1, i));
        if (isSame(result, expectedElement<To>(value))) continue;
        throw properties::Broken(pair + ": " + std::to_string(value) + " gives " +
                                 std::to_string(result) + " at " + std::to_string(i));
    }
}

}  // namespace oracle
