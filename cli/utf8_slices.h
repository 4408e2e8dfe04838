#pragma once

#include "fileio/host/text.h"

#include <cstddef>
#include <string_view>

#include <unicode/utf16.h>

namespace cli {

// Hands a text of any length on as UTF-8, in slices that end behind no first half of a pair.
template <class Use>
void forEachUtf8Slice(std::u16string_view text, Use use) {
    constexpr std::size_t sliceUnits = 1 << 16;
    while (text.size() > sliceUnits) {
        const std::size_t units = sliceUnits - (U16_IS_LEAD(text[sliceUnits - 1]) ? 1 : 0);
        use(vxTextToNarrow(text.data(), units));
        text.remove_prefix(units);
    }
    use(vxTextToNarrow(text.data(), text.size()));
}

}  // namespace cli
