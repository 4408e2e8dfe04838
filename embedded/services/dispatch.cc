#include "fileio/host/dispatch.h"

#include "embedded/services/array_layout.h"
#include "embedded/services/dispatch.h"
#include "embedded/services/element_types.h"
#include "embedded/services/number_syntax.h"
#include "fileio/errors/identifiers.h"
#include "fileio/host/messages.h"

#include <cmath>
#include <limits>
#include <span>
#include <utility>

namespace Orvandeil::FileIO::embedded {
namespace {

using Inputs = std::span<const vxArray* const>;

ArrayPtr sizeOf(Inputs inputs) {
    const Dimensions& lengths = inputs[0]->dimensions;
    ArrayPtr size = makeNumeric(vxDOUBLE_CLASS, {1, lengths.size()});
    auto* out = static_cast<double*>(realData(*size));
    for (const std::size_t length : lengths)
        *out++ = static_cast<double>(length);
    return size;
}

// The subscript (from 1) of a structure {type "()", subs {index}}, as an index from 0.
std::size_t subscript(const vxArray& structure, std::size_t count) {
    const vxArray* subs = structField(structure, "subs");
    const vxArray* index = subs == nullptr ? nullptr : cellContent(*subs);
    if (index != nullptr && index->classID == vxDOUBLE_CLASS && vxArrayIsScalar(index)) {
        const double number = vxArrayFirstAsDouble(index);
        const bool inside = number >= 1 && number <= static_cast<double>(count);
        if (inside && std::trunc(number) == number) return static_cast<std::size_t>(number) - 1;
    }
    vxErrMsgId(BadSubscript());
}

ArrayPtr stringElement(Inputs inputs) {
    if (inputs.size() < 2) return nullptr;
    const auto& texts = inputs[0]->contents->texts;
    return makeString(texts[subscript(*inputs[1], texts.size())]);
}

const StringElement& onlyText(Inputs inputs) {
    if (inputs[0]->contents->texts.size() != 1) {
        vxErrMsgId(KESTRA::string::MustBeStringScalarOrCharacterVector());
    }
    return inputs[0]->contents->texts.front();
}

ArrayPtr charsOfString(Inputs inputs) {
    const StringElement& text = onlyText(inputs);
    if (!text) vxErrMsgId(KESTRA::string::MissingNotSupported());
    return makeChars(*text);
}

// The number that a whole text spells; NaN for any other text, and for a missing one.
template <class T>
T numberOf(const StringElement& text) {
    if (!text) return std::numeric_limits<T>::quiet_NaN();
    std::string ascii;
    for (const char16_t unit : *text)
        ascii += unit < 0x80 ? static_cast<char>(unit) : '?';
    std::size_t consumed = 0;
    const T number = readNumber<T>(ascii, consumed);
    const bool whole = consumed > 0 && consumed == ascii.size();
    return whole ? number : std::numeric_limits<T>::quiet_NaN();
}

template <class T, vxClassID ClassID>
ArrayPtr numbersOfStrings(Inputs inputs) {
    ArrayPtr numbers = makeNumeric(ClassID, inputs[0]->dimensions);
    T* out = static_cast<T*>(realData(*numbers));
    for (const StringElement& text : inputs[0]->contents->texts)
        *out++ = numberOf<T>(text);
    return numbers;
}

template <class T>
void widenInto(void* target, const void* source, std::size_t count) {
    if (source == nullptr) return;
    const T* from = static_cast<const T*>(source);
    auto* to = static_cast<double*>(target);
    for (std::size_t i = 0; i < count; ++i)
        to[i] = static_cast<double>(from[i]);
}

ArrayPtr doublesOf(Inputs inputs) {
    const vxArray& array = *inputs[0];
    return withElementType(
        array.classID,
        [&]<class T>(ElementType<T>) {
            const vxComplexity complexity = array.imaginary ? vxCOMPLEX : vxREAL;
            ArrayPtr doubles = makeNumeric(vxDOUBLE_CLASS, array.dimensions, complexity);
            const std::size_t count = elementCount(array);
            widenInto<T>(realData(*doubles), array.real.get(), count);
            widenInto<T>(imaginaryData(*doubles), array.imaginary.get(), count);
            return doubles;
        },
        [] { return ArrayPtr(); });
}

ArrayPtr stringOfChars(Inputs inputs) {
    const vxArray& chars = *inputs[0];
    const std::size_t count = elementCount(chars);
    const bool oneRow = chars.dimensions.size() == 2 && (chars.dimensions[0] == 1 || count == 0);
    if (!oneRow) return nullptr;
    const auto* text = static_cast<const char16_t*>(chars.real.get());
    return makeString(count == 0 ? std::u16string() : std::u16string(text, count));
}

ArrayPtr sameAgain(Inputs inputs) {
    return copyOf(*inputs[0]);
}

struct Entry {
    std::string_view function;
    std::string_view className;  // empty: every class without functions of its own
    ArrayPtr (*run)(Inputs);
};

constexpr Entry functions[] = {
    {"subsref", "string", stringElement},
    {"char", "string", charsOfString},
    {"string", "string", sameAgain},
    {"double", "string", numbersOfStrings<double, vxDOUBLE_CLASS>},
    {"single", "string", numbersOfStrings<float, vxSINGLE_CLASS>},
    {"char", "char", sameAgain},
    {"string", "char", stringOfChars},
    {"size", "", sizeOf},
    {"double", "", doublesOf},
};

ArrayPtr callOwn(const FunctionTable& table, std::string_view name, Inputs inputs) {
    const auto found = table.find(name);
    return found == table.end() ? nullptr : found->second(inputs);
}

}  // namespace

ArrayPtr callFunction(std::string_view name, Inputs inputs) {
    if (inputs.empty()) return nullptr;
    const vxArray& first = *inputs[0];
    if (first.contents && first.contents->functions) {
        return callOwn(*first.contents->functions, name, inputs);
    }
    const std::string_view className = vxArrayClassName(&first);
    for (const Entry& entry : functions) {
        const bool ofClass = entry.className.empty() || entry.className == className;
        if (entry.function == name && ofClass) return entry.run(inputs);
    }
    return nullptr;
}

}  // namespace Orvandeil::FileIO::embedded

using namespace Orvandeil::FileIO::embedded;

vxArray* vxDispatchCall(const char* name, const vxArray* const* inputs, std::size_t count) {
    return callFunction(name, {inputs, count}).release();
}

bool vxStringArrayIs(const vxArray* array) {
    return array->classID == vxOBJECT_CLASS && array->contents->className == "string" &&
           !array->contents->functions;
}

bool vxStringArrayIsMissing(const vxArray* array, std::size_t index) {
    return !array->contents->texts[index].has_value();
}

std::u16string vxStringArrayText(const vxArray* array, std::size_t index) {
    return array->contents->texts[index].value();
}
