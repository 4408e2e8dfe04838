#include "cli/plain_writer.h"

#include "cli/number_text.h"
#include "embedded/services/array.h"
#include "embedded/services/element_types.h"
#include "fileio/host/dispatch.h"
#include "fileio/host/text.h"

#include <span>

namespace cli {

namespace embedded = Orvandeil::FileIO::embedded;

namespace {

template <class T>
std::span<const T> elementsOf(const vxArray& array) {
    return {static_cast<const T*>(vxArrayData(&array)), embedded::elementCount(array)};
}

template <class T>
std::string numberLines(std::span<const T> elements, std::size_t rows) {
    std::string text;
    for (std::size_t row = 0; row < rows; ++row) {
        for (std::size_t i = row; i < elements.size(); i += rows) {
            if (i != row) text += '\t';
            text += NumberText(elements[i]).view();
        }
        text += '\n';
    }
    return text;
}

std::string charLines(std::span<const char16_t> units, std::size_t rows) {
    std::string text;
    for (std::size_t row = 0; row < rows; ++row) {
        std::u16string line;
        for (std::size_t i = row; i < units.size(); i += rows)
            line += units[i];
        text += vxTextToNarrow(line.data(), line.size()) + '\n';
    }
    return text;
}

std::string stringLines(const vxArray& array) {
    std::string text;
    for (std::size_t i = 0; i < embedded::elementCount(array); ++i) {
        const bool isMissing = vxStringArrayIsMissing(&array, i);
        const std::u16string element = isMissing ? u"<missing>" : vxStringArrayText(&array, i);
        text += vxTextToNarrow(element.data(), element.size()) + '\n';
    }
    return text;
}

}  // namespace

std::string plainText(const vxArray& array) {
    if (vxStringArrayIs(&array)) return stringLines(array);
    const std::size_t rows = embedded::elementCount(array) == 0 ? 0 : vxArrayDimensions(&array)[0];
    const vxClassID classID = vxArrayClassID(&array);
    if (classID == vxCHAR_CLASS) return charLines(elementsOf<char16_t>(array), rows);
    return embedded::withElementType(
        classID,
        [&]<class T>(embedded::ElementType<T>) { return numberLines(elementsOf<T>(array), rows); },
        [] { return std::string(); });
}

}  // namespace cli
