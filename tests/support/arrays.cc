#include "tests/support/arrays.h"

#include "embedded/services/element_types.h"
#include "fileio/host/dispatch.h"
#include "tests/support/printing.h"

#include <charconv>

namespace support {

using namespace Orvandeil::FileIO::embedded;

std::string listed(vxClassID classID, const void* values, std::size_t count) {
    std::string list;
    const auto append = [&]<class T>(ElementType<T>) {
        for (std::size_t i = 0; i < count; ++i) {
            char text[40];
            const T value = static_cast<const T*>(values)[i];
            list.append(i == 0 ? "" : " ")
                .append(text, std::to_chars(text, std::end(text), value).ptr);
        }
    };
    withElementType(classID, append, [] {});
    return list;
}

std::string shown(const vxArray* array) {
    if (!array) return "none";
    std::string text = vxArrayClassName(array);
    for (std::size_t i = 0; i < vxArrayDimensionCount(array); ++i)
        text += (i == 0 ? ' ' : 'x') + std::to_string(vxArrayDimensions(array)[i]);
    const vxClassID classID = vxArrayClassID(array);
    const std::size_t count = elementCount(*array);
    text += ": " + listed(classID, vxArrayData(array), count);
    if (vxArrayIsComplex(array)) text += " + i " + listed(classID, imaginaryData(*array), count);
    for (std::size_t i = 0; vxStringArrayIs(array) && i < count; ++i) {
        const bool isMissing = vxStringArrayIsMissing(array, i);
        text +=
            isMissing ? "missing" : "'" + fileio_tests::toUtf8(vxStringArrayText(array, i)) + "'";
    }
    return text;
}

}  // namespace support
