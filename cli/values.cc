#include "cli/values.h"

#include "cli/element_reader.h"
#include "cli/usage_error.h"
#include "cli/value_literal.h"
#include "embedded/npy/npy_file.h"
#include "embedded/services/element_types.h"
#include "fileio/host/text.h"

#include <algorithm>
#include <array>
#include <limits>
#include <string>
#include <type_traits>

namespace cli {

namespace embedded = Orvandeil::FileIO::embedded;
using embedded::ArrayPtr;

namespace {

constexpr std::array classes = {vxLOGICAL_CLASS, vxCHAR_CLASS,   vxINT8_CLASS,   vxINT16_CLASS,
                                vxINT32_CLASS,   vxINT64_CLASS,  vxUINT8_CLASS,  vxUINT16_CLASS,
                                vxUINT32_CLASS,  vxUINT64_CLASS, vxSINGLE_CLASS, vxDOUBLE_CLASS};

std::u16string wide(std::string_view text) {
    return vxTextFromNarrow(text.data(), text.size());
}

// Counted in characters from 1.
std::size_t columnOf(std::string_view text, std::size_t place) {
    const auto startsCharacter = [](char c) {
        return (static_cast<unsigned char>(c) & 0xC0) != 0x80;
    };
    return 1 +
           static_cast<std::size_t>(std::ranges::count_if(text.substr(0, place), startsCharacter));
}

[[noreturn]] void refuse(std::string_view argument, std::size_t place, const std::string& reason) {
    throw UsageError("value \"" + std::string(argument) + "\", column " +
                     std::to_string(columnOf(argument, place)) + ": " + reason);
}

[[noreturn]] void refuseRows(std::string_view argument, std::size_t prefix,
                             const Literal& literal) {
    const std::size_t length = literal.elements.size() - literal.rows * literal.columns;
    refuse(argument, prefix + literal.place,
           "row " + std::to_string(literal.rows + 1) + " has length " + std::to_string(length) +
               ", not " + std::to_string(literal.columns) + " as the rows before it");
}

// Calls store(index, element) with the column-major index of every element.
template <class Store>
void forEachElement(const Literal& literal, Store store) {
    for (std::size_t i = 0; i < literal.elements.size(); ++i) {
        const std::size_t row = i / literal.columns;
        const std::size_t column = i % literal.columns;
        store(column * literal.rows + row, literal.elements[i]);
    }
}

template <class T>
T readElement(std::string_view element, [[maybe_unused]] T highest) {
    if constexpr (std::is_floating_point_v<T>) {
        return readFloating<T>(element);
    } else {
        return readWhole<T>(element, std::numeric_limits<T>::lowest(), highest);
    }
}

ArrayPtr realArray(const Literal& literal, vxClassID classID) {
    ArrayPtr array = embedded::makeNumeric(classID, {literal.rows, literal.columns});
    const auto fill = [&]<class T>(embedded::ElementType<T>) {
        const T highest = classID == vxLOGICAL_CLASS ? T{1} : std::numeric_limits<T>::max();
        T* data = static_cast<T*>(embedded::realData(*array));
        forEachElement(literal, [data, highest](std::size_t index, std::string_view element) {
            data[index] = readElement<T>(element, highest);
        });
    };
    embedded::withElementType(classID, fill, [] {});
    return array;
}

// `+2i` to 2; `-i` to -1.
double readImaginary(std::string_view part) {
    if (part.empty()) return 0;
    part.remove_suffix(1);
    const bool onlySign = part.empty() || part == "+" || part == "-";
    return onlySign ? (part == "-" ? -1 : 1) : readFloating<double>(part);
}

ArrayPtr complexArray(const Literal& literal) {
    ArrayPtr array =
        embedded::makeNumeric(vxDOUBLE_CLASS, {literal.rows, literal.columns}, vxCOMPLEX);
    auto* real = static_cast<double*>(embedded::realData(*array));
    auto* imaginary = static_cast<double*>(embedded::imaginaryData(*array));
    forEachElement(literal, [real, imaginary](std::size_t index, std::string_view element) {
        const std::size_t split = realPartLength(element);
        real[index] = split == 0 ? 0 : readFloating<double>(element.substr(0, split));
        imaginary[index] = readImaginary(element.substr(split));
    });
    return array;
}

// The number or matrix that must follow a prefix of that length.
Literal readPrefixed(std::string_view argument, std::size_t prefix, ElementLength elementLength) {
    Literal literal = readLiteral(argument.substr(prefix), elementLength);
    if (literal.state == Literal::UnequalRows) refuseRows(argument, prefix, literal);
    if (literal.state == Literal::NotALiteral) {
        refuse(argument, prefix + literal.place,
               "a number or a matrix of numbers is needed behind \"" +
                   std::string(argument.substr(0, prefix)) + '"');
    }
    return literal;
}

ArrayPtr readString(std::string_view text) {
    if (text == "<missing>") return embedded::makeString(std::nullopt);
    return embedded::makeString(wide(text));
}

bool isNumpyFile(std::string_view argument) {
    constexpr std::string_view ending = ".npy";
    return argument.size() > ending.size() + 1 && argument.starts_with('@') &&
           argument.ends_with(ending);
}

bool isQuoted(std::string_view argument) {
    return argument.size() >= 2 && argument.starts_with('\'') && argument.ends_with('\'');
}

// Whether numbers are meant, well-formed or not; "double: yes" is a text like any other.
bool looksLikeNumbers(std::string_view text) {
    return text.starts_with("Inf") || text.starts_with("NaN") ||
           text.find_first_of("[+-.0123456789") == 0;
}

ArrayPtr readBare(std::string_view argument) {
    const Literal literal = readLiteral(argument, realLength);
    if (literal.state == Literal::UnequalRows) refuseRows(argument, 0, literal);
    if (literal.state == Literal::Complete) return realArray(literal, vxDOUBLE_CLASS);
    return embedded::makeChars(wide(argument));
}

}  // namespace

std::optional<vxClassID> elementClass(std::string_view name) {
    const auto found = std::ranges::find(classes, name, embedded::nameOfClass);
    if (found == classes.end()) return std::nullopt;
    return *found;
}

std::vector<std::string_view> elementClassNames() {
    std::vector<std::string_view> names;
    for (const vxClassID classID : classes)
        names.push_back(embedded::nameOfClass(classID));
    return names;
}

ArrayPtr readValue(std::string_view argument) {
    if (isQuoted(argument)) {
        return embedded::makeChars(wide(argument.substr(1, argument.size() - 2)));
    }
    if (isNumpyFile(argument)) return embedded::npyRead(std::string(argument.substr(1)));
    const std::size_t prefix = argument.find(':') + 1;  // 0 when there is none
    if (prefix > 0) {
        const std::string_view name = argument.substr(0, prefix - 1);
        const std::string_view rest = argument.substr(prefix);
        if (name == "string") return readString(rest);
        if (!looksLikeNumbers(rest)) return embedded::makeChars(wide(argument));
        if (name == "complex") {
            return complexArray(readPrefixed(argument, prefix, complexLength));
        }
        if (const auto classID = elementClass(name)) {
            return realArray(readPrefixed(argument, prefix, realLength), *classID);
        }
    }
    return readBare(argument);
}

}  // namespace cli
