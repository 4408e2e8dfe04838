#include "embedded/npy/npy_header.h"

#include "embedded/npy/identifiers.h"
#include "fileio/host/messages.h"

#include <algorithm>
#include <bit>
#include <charconv>
#include <cstdint>

namespace Orvandeil::FileIO::embedded {
namespace {

// Reading takes the first row of a code, writing the first row of a class.
constexpr NpyType types[] = {
    {"b1", vxLOGICAL_CLASS, vxREAL},    {"i1", vxINT8_CLASS, vxREAL},
    {"i2", vxINT16_CLASS, vxREAL},      {"i4", vxINT32_CLASS, vxREAL},
    {"i8", vxINT64_CLASS, vxREAL},      {"u1", vxUINT8_CLASS, vxREAL},
    {"u2", vxUINT16_CLASS, vxREAL},     {"u4", vxUINT32_CLASS, vxREAL},
    {"u8", vxUINT64_CLASS, vxREAL},     {"f4", vxSINGLE_CLASS, vxREAL},
    {"f8", vxDOUBLE_CLASS, vxREAL},     {"c8", vxSINGLE_CLASS, vxCOMPLEX},
    {"c16", vxDOUBLE_CLASS, vxCOMPLEX}, {"u2", vxCHAR_CLASS, vxREAL},
};

const NpyType* findCode(std::string_view code) {
    const auto* found = std::find_if(std::begin(types), std::end(types),
                                     [&](const NpyType& type) { return type.code == code; });
    return found == std::end(types) ? nullptr : found;
}

// Hostile text on its way into a message: one line, not endless.
std::string shown(std::string_view text) {
    constexpr std::size_t enough = 40;
    std::string line(text.substr(0, enough));
    for (char& letter : line) {
        if (letter < ' ' || letter > '~') letter = '?';
    }
    return text.size() > enough ? line + "..." : line;
}

class HeaderParser {
public:
    HeaderParser(std::string_view text, const std::string& fileName) : rest(text), file(fileName) {}

    NpyHeader parse() {
        expect('{', "it is no dictionary");
        while (!take('}')) {
            parseEntry();
            if (take(',')) continue;
            expect('}', "its entries are not separated by commas");
            break;
        }
        skipBlanks();
        if (!rest.empty()) fail("something follows the dictionary");
        if (!hasType || !hasOrder || !hasShape) fail("a key is missing");
        checkSize();
        return header;
    }

private:
    [[noreturn]] void fail(const char* reason) const {
        vxErrMsgId(KESTRA::npy::badHeader(file, reason));
    }

    void skipBlanks() {
        rest.remove_prefix(std::min(rest.find_first_not_of(" \t\r\n\f\v"), rest.size()));
    }

    bool take(char expected) {
        skipBlanks();
        if (!rest.starts_with(expected)) return false;
        rest.remove_prefix(1);
        return true;
    }

    bool takeWord(std::string_view word) {
        skipBlanks();
        if (!rest.starts_with(word)) return false;
        rest.remove_prefix(word.size());
        return true;
    }

    void expect(char expected, const char* reason) {
        if (!take(expected)) fail(reason);
    }

    std::string_view takeString(const char* reason) {
        skipBlanks();
        const char quote = rest.empty() ? '\0' : rest.front();
        if (quote != '\'' && quote != '"') fail(reason);
        const std::size_t end = rest.find(quote, 1);
        if (end == std::string_view::npos) fail("a text has no end");
        const std::string_view content = rest.substr(1, end - 1);
        rest.remove_prefix(end + 1);
        return content;
    }

    void parseEntry() {
        const std::string_view key = takeString("a key is no text");
        expect(':', "a key has no value");
        if (key == "descr") {
            once(hasType);
            parseType();
        } else if (key == "fortran_order") {
            once(hasOrder);
            parseOrder();
        } else if (key == "shape") {
            once(hasShape);
            parseShape();
        } else {
            fail("a key is unknown");
        }
    }

    void once(bool& seen) {
        if (seen) fail("a key stands twice");
        seen = true;
    }

    void parseType() {
        skipBlanks();
        // Records and nested arrays are lists and tuples; nothing in them needs a look.
        if (rest.starts_with('[') || rest.starts_with('(')) unsupported(rest);
        const std::string_view description = takeString("its element type is no text");
        const std::size_t orderLength = description.find_first_not_of("<>|=") == 1 ? 1 : 0;
        header.type = findCode(description.substr(orderLength));
        if (header.type == nullptr) unsupported(description);
        const bool isNativeBig = std::endian::native == std::endian::big;
        header.isBigEndian =
            description.front() == '>' || (description.front() != '<' && isNativeBig);
    }

    [[noreturn]] void unsupported(std::string_view description) const {
        vxErrMsgId(KESTRA::npy::unsupportedType(file, shown(description)));
    }

    void parseOrder() {
        header.isFortranOrder = takeWord("True");
        if (!header.isFortranOrder && !takeWord("False"))
            fail("its order is neither True nor False");
    }

    void parseShape() {
        expect('(', "its shape is no tuple");
        while (!take(')')) {
            if (header.shape.size() == maxNpyDimensions) fail("its shape has too many dimensions");
            header.shape.push_back(takeLength());
            if (take(',')) continue;
            expect(')', "its shape has no end");
            // In Python, one number in parentheses is no tuple.
            if (header.shape.size() == 1) fail("its shape is no tuple");
            break;
        }
    }

    std::size_t takeLength() {
        skipBlanks();
        std::size_t length = 0;
        const auto [end, error] = std::from_chars(rest.data(), rest.data() + rest.size(), length);
        if (error == std::errc::result_out_of_range) fail("its shape is too large");
        if (error != std::errc()) fail("its shape holds something that is no length");
        rest.remove_prefix(static_cast<std::size_t>(end - rest.data()));
        takeWord("L");  // as written by Python 2
        return length;
    }

    // An array has to be addressable even if one of its lengths were not 0.
    void checkSize() const {
        std::size_t bytes = npyElementBytes(*header.type);
        for (const std::size_t length : header.shape) {
            if (__builtin_mul_overflow(bytes, std::max<std::size_t>(length, 1), &bytes) ||
                bytes > PTRDIFF_MAX) {
                fail("its shape is too large");
            }
        }
    }

    std::string_view rest;
    const std::string& file;
    NpyHeader header;
    bool hasType = false;
    bool hasOrder = false;
    bool hasShape = false;
};

std::string formatShape(const Dimensions& shape) {
    std::string text = "(";
    for (std::size_t i = 0; i < shape.size(); ++i) {
        if (i > 0) text += ", ";
        text += std::to_string(shape[i]);
    }
    if (shape.size() == 1) text += ',';
    return text + ')';
}

}  // namespace

const NpyType* findNpyType(vxClassID classID, vxComplexity complexity) {
    const auto* found = std::find_if(std::begin(types), std::end(types), [&](const NpyType& type) {
        return type.classID == classID && type.complexity == complexity;
    });
    return found == std::end(types) ? nullptr : found;
}

std::size_t npyElementBytes(const NpyType& type) {
    return elementBytes(type.classID) * (type.complexity == vxCOMPLEX ? 2 : 1);
}

std::size_t npyElementCount(const Dimensions& shape) {
    std::size_t count = 1;
    for (const std::size_t length : shape)
        count *= length;
    return count;
}

NpyHeader parseNpyHeader(std::string_view text, const std::string& file) {
    return HeaderParser(text, file).parse();
}

std::string formatNpyHeader(const NpyHeader& header) {
    constexpr std::size_t alignment = 64;
    constexpr std::string_view beginning("\x93NUMPY\x01\x00", 8);
    const bool isByte = elementBytes(header.type->classID) == 1;
    std::string dictionary = std::string("{'descr': '") + (isByte ? '|' : '<');
    dictionary += header.type->code;
    dictionary += "', 'fortran_order': ";
    dictionary += header.isFortranOrder ? "True" : "False";
    dictionary += ", 'shape': " + formatShape(header.shape) + ", }";

    const std::size_t used = beginning.size() + 2 + dictionary.size() + 1;
    dictionary.append((alignment - used % alignment) % alignment, ' ');
    dictionary += '\n';
    std::string text(beginning);
    text += static_cast<char>(dictionary.size() & 0xFF);
    text += static_cast<char>(dictionary.size() >> 8);
    return text + dictionary;
}

}  // namespace Orvandeil::FileIO::embedded
