#include "tests/oracle/conversion_oracle.h"
#include "tests/properties/properties.h"

namespace properties {
namespace {

using namespace Orvandeil::FileIO;
using detail::Logical;

template <class From>
void checkFrom(Bytes& input, vxClassID from) {
    std::vector<From> elements(input.below(input.below(2) == 0 ? 300 : 20));
    const bool areReal = input.below(2) == 0;
    for (From& element : elements) {
        if constexpr (std::is_floating_point_v<From>) {
            element = static_cast<From>(areReal ? input.real() : input.real() / 3);
        } else {
            element = static_cast<From>(input.number(areReal ? sizeof(From) : 1));
        }
    }
    const std::size_t target = input.below(12);
    std::size_t index = 0;
#define CHECK_PAIR(to, To) \
    if (index++ == target) oracle::checkRun<To, From>(to, from, elements);
    FILEIO_FOR_EACH_ELEMENT(CHECK_PAIR)
#undef CHECK_PAIR
}

}  // namespace

// A run of any length and content, from any class to any other.
void conversions(Bytes& input) {
    const std::size_t source = input.below(12);
    std::size_t index = 0;
#define CHECK_FROM(from, From) \
    if (index++ == source) return checkFrom<From>(input, from);
    FILEIO_FOR_EACH_ELEMENT(CHECK_FROM)
#undef CHECK_FROM
}

}  // namespace properties
