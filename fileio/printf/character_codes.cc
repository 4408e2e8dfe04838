#include "fileio/printf/element_range.h"
#include "fileio/printf/printf_argument_source.h"

#include <algorithm>

namespace Orvandeil::FileIO::detail {
namespace {

// Stores what the value is as a code, if it is one, in a form without branches.
template <class Number>
bool takeCode(Number value, char16_t& unit) {
    if constexpr (std::is_floating_point_v<Number>) {
        const Number bounded = value >= 0 && value <= 0xFFFF ? value : Number{};
        const auto whole = static_cast<std::int32_t>(bounded);
        unit = static_cast<char16_t>(whole);
        return static_cast<Number>(whole) == value;
    } else {
        unit = static_cast<char16_t>(value);
        return std::in_range<std::uint16_t>(value);
    }
}

template <class Element>
std::size_t copyCodes(const char* elements, std::size_t count, char16_t* out) {
    constexpr std::size_t blockElements = 64;
    for (std::size_t done = 0; done < count;) {
        const std::size_t end = done + std::min(blockElements, count - done);
        bool codes = true;
        for (std::size_t i = done; i < end; ++i)
            codes = static_cast<int>(codes) &
                    static_cast<int>(takeCode(toNumber(loadElement<Element>(elements, i)), out[i]));
        if (!codes) {
            while (takeCode(toNumber(loadElement<Element>(elements, done)), out[done]))
                ++done;
            return done;
        }
        done = end;
    }
    return count;
}

}  // namespace

std::size_t copyCharacterCodes(const PlainElements& elements, char16_t* out) {
    switch (elements.classID) {
#define FILEIO_COPY_CODES(classID, Type) \
    case classID:                        \
        return copyCodes<Type>(elements.first, elements.count, out);
        FILEIO_FOR_EACH_ELEMENT(FILEIO_COPY_CODES)
#undef FILEIO_COPY_CODES
        default:
            return 0;
    }
}

}  // namespace Orvandeil::FileIO::detail
