#include "cli/values.h"

#include "cli/number_text.h"
#include "cli/usage_error.h"
#include "embedded/services/element_types.h"
#include "fileio/host/dispatch.h"
#include "tests/properties/properties.h"
#include "tests/support/arrays.h"
#include "tests/support/printing.h"
#include "tests/support/raised.h"

namespace properties {
namespace {

using namespace Orvandeil::FileIO::embedded;

template <class Text>
std::string matrixOf(const vxArray& array, Text element) {
    const std::size_t rows = vxArrayDimensions(&array)[0];
    std::string text = "[";
    for (std::size_t i = 0; i < elementCount(array); ++i) {
        const std::size_t columns = elementCount(array) / rows;
        text += element(i % columns * rows + i / columns);
        text += (i + 1) % columns == 0 ? ";" : " ";
    }
    return text + ']';
}

// The argument that stands for an array. A missing string prints as none of its texts.
std::string spelt(const vxArray& array) {
    if (vxStringArrayIs(&array)) {
        const bool isMissing = vxStringArrayIsMissing(&array, 0);
        return "string:" +
               (isMissing ? "<missing>" : fileio_tests::toUtf8(vxStringArrayText(&array, 0)));
    }
    const vxClassID classID = vxArrayClassID(&array);
    std::string text = std::string(nameOfClass(classID)) + ':';
    const auto append = [&]<class T>(ElementType<T>) {
        const auto* const real = static_cast<const T*>(vxArrayData(&array));
        const auto* const imaginary = static_cast<const T*>(imaginaryData(array));
        text = imaginary ? "complex:" : text;
        text += matrixOf(array, [&](std::size_t i) {
            std::string element(cli::NumberText(real[i]).view());
            if (!imaginary) return element;
            const std::string part(cli::NumberText(imaginary[i]).view());
            return element + (part[0] == '-' ? "" : "+") + part + 'i';
        });
    };
    withElementType(classID, append, [] {});
    return text;
}

// Not-a-number has no sign that is kept.
std::string shown(const vxArray* array) {
    std::string text = support::shown(array);
    for (std::size_t at; (at = text.find("-nan")) != text.npos;)
        text.erase(at, 1);
    return text;
}

}  // namespace

// Any argument is a value or refused, and a value written out is the same value.
void values(Bytes& input) {
    static const std::vector<std::string> parts = split(
        "[|]|;| |,|1|-2.5|1e300|Inf|NaN|int8:|uint64:|single:|double:|char:|logical:|'|string:|"
        "complex:|i|+|1+2i|-i|.|e-9|@|.npy|int64:|18446744073709551615|<missing>|é|\xFF|0x|"
        "\xF0\x9F\x98\x80|:");
    const std::string argument = input.text(parts, 14);
    ArrayPtr array;
    std::string refused;
    try {
        refused = fileio_tests::raisedBy([&] { array = cli::readValue(argument); });
    } catch (const cli::UsageError& error) {
        refused = error.what();
    }
    input.observe(refused + support::shown(array.get()));
    if (!array) return;
    const std::string again = spelt(*array);
    requireEqual(shown(cli::readValue(again).get()), shown(array.get()),
                 argument + " again as " + again);
}

}  // namespace properties
