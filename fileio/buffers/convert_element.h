#pragma once

#include "fileio/host/arrays.h"

#include <cmath>
#include <concepts>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <limits>
#include <type_traits>

// The conversion of one element. Everything that moves elements between classes is made from it.
namespace Orvandeil::FileIO::detail {

// A logical element. A type of its own, since 0 and 1 are its only values but not, as for bool, its
// only bit patterns.
enum class Logical : std::uint8_t {};

// The classes with plain elements and the types of those.
// clang-format off
#define FILEIO_FOR_EACH_ELEMENT(apply)   \
    apply(vxLOGICAL_CLASS, Logical)      \
    apply(vxCHAR_CLASS, char16_t)        \
    apply(vxDOUBLE_CLASS, double)        \
    apply(vxSINGLE_CLASS, float)         \
    apply(vxINT8_CLASS, std::int8_t)     \
    apply(vxUINT8_CLASS, std::uint8_t)   \
    apply(vxINT16_CLASS, std::int16_t)   \
    apply(vxUINT16_CLASS, std::uint16_t) \
    apply(vxINT32_CLASS, std::int32_t)   \
    apply(vxUINT32_CLASS, std::uint32_t) \
    apply(vxINT64_CLASS, std::int64_t)   \
    apply(vxUINT64_CLASS, std::uint64_t)
// clang-format on

inline constexpr int firstElementClass = vxLOGICAL_CLASS;
inline constexpr int lastElementClass = vxUINT64_CLASS;

// The element type of a class; void for a class without plain elements.
template <int classID>
struct ElementOf {
    using type = void;
};
#define FILEIO_DECLARE_ELEMENT(classID, Type) \
    template <>                               \
    struct ElementOf<classID> {               \
        using type = Type;                    \
    };
FILEIO_FOR_EACH_ELEMENT(FILEIO_DECLARE_ELEMENT)
#undef FILEIO_DECLARE_ELEMENT

// What an element is as a number: its arithmetic type and the ends of its range.
template <class Element>
struct NumberOf {
    using type = Element;
    static constexpr type lowest = std::numeric_limits<type>::lowest();
    static constexpr type highest = std::numeric_limits<type>::max();
};
template <>
struct NumberOf<char16_t> : NumberOf<std::uint16_t> {};
template <>
struct NumberOf<Logical> {
    using type = std::uint8_t;
    static constexpr type lowest = 0;
    static constexpr type highest = 1;
};
template <class Element>
using Number = typename NumberOf<Element>::type;

template <class Element>
constexpr Number<Element> toNumber(Element element) {
    return static_cast<Number<Element>>(element);
}
constexpr std::uint8_t toNumber(Logical element) {
    return static_cast<std::uint8_t>(element) != 0;
}

// Integer to integer: the nearest value of the target's range.
template <class To, std::integral From>
constexpr To saturate(From value) {
    constexpr auto lowest = NumberOf<To>::lowest;
    constexpr auto highest = NumberOf<To>::highest;
    if constexpr (std::is_signed_v<From>) {
        if constexpr (std::is_unsigned_v<decltype(lowest)>) {
            if (value < 0) value = 0;
        } else if constexpr (sizeof(From) > sizeof(To)) {
            if (value < From{lowest}) value = lowest;
        }
    }
    using Magnitude = std::make_unsigned_t<From>;
    constexpr std::uint64_t limit = std::uint64_t{highest};
    if constexpr (limit < std::uint64_t{std::numeric_limits<From>::max()}) {
        constexpr auto end = static_cast<From>(static_cast<Magnitude>(limit));
        if (value > end) value = end;
    }
    return static_cast<To>(value);
}

// The largest double within the range of an element type of integers.
template <class To>
consteval double highestDouble() {
    constexpr auto highest = NumberOf<To>::highest;
    constexpr int digits = std::numeric_limits<Number<To>>::digits;
    constexpr int excess = digits > 53 ? digits - 53 : 0;
    return static_cast<double>(highest >> excess << excess);
}

// Floating to integer: NaN gives 0, halves go away from zero, values out of range to its nearest
// end. Bounded before the cast, which is undefined out of range. What is added before truncating is
// the double just below a half: a sum with the half itself would round 0.49999999999999994 and odd
// numbers above 2^52 up, and this one still rounds halves up.
template <class To>
inline To roundAndSaturate(double value) {
    constexpr auto lowest = static_cast<double>(NumberOf<To>::lowest);
    constexpr double highest = highestDouble<To>();
    constexpr double justBelowHalf = 0.49999999999999994;
    using Whole = std::conditional_t<
        sizeof(To) == 8, Number<To>,
        std::conditional_t<std::is_same_v<To, std::uint32_t>, std::int64_t, std::int32_t>>;

    const double atLeast = value > lowest ? value : lowest;
    const double bounded = atLeast < highest ? atLeast : highest;
    const double number = value == value ? bounded : 0;
    const auto rounded = static_cast<Whole>(number + std::copysign(justBelowHalf, number));
    if constexpr (sizeof(To) == 8) return value > highest ? NumberOf<To>::highest : rounded;
    return static_cast<To>(rounded);
}

// The one conversion: the same, to floating, floating to integer, or integer to integer.
template <class To, class From>
inline To convertElement(From value) {
    if constexpr (std::is_same_v<To, From>) {
        return value;
    } else if constexpr (std::is_floating_point_v<To> && std::is_same_v<From, Logical>) {
        return toNumber(value) != 0 ? To{1} : To{0};
    } else if constexpr (std::is_floating_point_v<To>) {
        return static_cast<To>(toNumber(value));
    } else if constexpr (std::is_floating_point_v<From>) {
        return roundAndSaturate<To>(double{value});
    } else {
        return saturate<To>(toNumber(value));
    }
}

// Element `index` of a block that need not be aligned.
template <class Element>
inline Element loadElement(const void* elements, std::size_t index) {
    Element element;
    std::memcpy(&element, static_cast<const char*>(elements) + index * sizeof element,
                sizeof element);
    return element;
}

// Converts element `index` of a block of class `source`. False for a class without plain elements.
template <class To>
inline bool readElement(vxClassID source, const void* elements, std::size_t index, To& out) {
    switch (source) {
#define FILEIO_READ_ELEMENT(classID, Type)                            \
    case classID:                                                     \
        out = convertElement<To>(loadElement<Type>(elements, index)); \
        return true;
        FILEIO_FOR_EACH_ELEMENT(FILEIO_READ_ELEMENT)
#undef FILEIO_READ_ELEMENT
        default:
            return false;
    }
}

}  // namespace Orvandeil::FileIO::detail
