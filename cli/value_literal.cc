#include "cli/value_literal.h"

namespace cli {
namespace {

bool isDigit(char c) {
    return c >= '0' && c <= '9';
}

std::size_t digitsLength(std::string_view text) {
    std::size_t length = 0;
    while (length < text.size() && isDigit(text[length]))
        ++length;
    return length;
}

std::size_t signLength(std::string_view text) {
    return !text.empty() && (text[0] == '+' || text[0] == '-') ? 1 : 0;
}

std::size_t exponentLength(std::string_view text) {
    if (text.empty() || (text[0] != 'e' && text[0] != 'E')) return 0;
    const std::size_t sign = 1 + signLength(text.substr(1));
    const std::size_t digits = digitsLength(text.substr(sign));
    return digits == 0 ? 0 : sign + digits;
}

std::size_t unsignedLength(std::string_view text) {
    if (text.starts_with("Inf") || text.starts_with("NaN")) return 3;
    const std::size_t whole = digitsLength(text);
    std::size_t length = whole;
    if (length < text.size() && text[length] == '.') {
        const std::size_t fraction = digitsLength(text.substr(length + 1));
        if (whole + fraction > 0) length += 1 + fraction;
    }
    return length == 0 ? 0 : length + exponentLength(text.substr(length));
}

// With a sign in front when `signNeeded`, and an `i` behind; the number itself may be left out.
std::size_t imaginaryLength(std::string_view text, bool signNeeded) {
    std::size_t length = signLength(text);
    if (signNeeded && length == 0) return 0;
    length += unsignedLength(text.substr(length));
    return length < text.size() && text[length] == 'i' ? length + 1 : 0;
}

// Walks over the inside of one pair of brackets.
class MatrixReader {
public:
    MatrixReader(std::string_view matrix, ElementLength length)
        : text(matrix), elementLength(length) {}

    Literal read() {
        do {
            if (!readRow() || !storeRow()) return stopped();
        } while (text[cursor++] == ';');
        if (cursor != text.size()) return stopped();
        literal.state = Literal::Complete;
        return literal;
    }

private:
    Literal stopped() {
        literal.place = cursor;
        return literal;
    }

    char here() const { return cursor < text.size() ? text[cursor] : '\0'; }
    bool atRowEnd() const { return here() == ';' || here() == ']'; }

    bool skipBlanks() {
        const std::size_t start = cursor;
        while (here() == ' ' || here() == '\t')
            ++cursor;
        return cursor != start;
    }

    bool readElement() {
        const std::size_t length = elementLength(text.substr(cursor));
        if (length == 0) return false;
        literal.elements.push_back(text.substr(cursor, length));
        cursor += length;
        ++rowLength;
        return true;
    }

    // Up to the `;` or `]` that ends the row. False when something does not fit.
    bool readRow() {
        rowLength = 0;
        skipBlanks();
        if (atRowEnd()) return true;
        while (readElement()) {
            const bool blank = skipBlanks();
            if (atRowEnd()) return true;
            if (here() == ',') {
                ++cursor;
                skipBlanks();
            } else if (!blank) {
                return false;
            }
        }
        return false;
    }

    bool storeRow() {
        if (rowLength == 0) return true;
        if (literal.rows > 0 && literal.columns != rowLength) {
            literal.state = Literal::UnequalRows;
            return false;
        }
        literal.columns = rowLength;
        ++literal.rows;
        return true;
    }

    std::string_view text;
    ElementLength elementLength;
    std::size_t cursor = 1;
    std::size_t rowLength = 0;
    Literal literal;
};

}  // namespace

std::size_t realLength(std::string_view text) {
    const std::size_t sign = signLength(text);
    const std::size_t length = unsignedLength(text.substr(sign));
    return length == 0 ? 0 : sign + length;
}

std::size_t complexLength(std::string_view text) {
    if (const std::size_t imaginary = imaginaryLength(text, false)) return imaginary;
    const std::size_t real = realLength(text);
    return real == 0 ? 0 : real + imaginaryLength(text.substr(real), true);
}

std::size_t realPartLength(std::string_view element) {
    return imaginaryLength(element, false) == element.size() ? 0 : realLength(element);
}

Literal readLiteral(std::string_view text, ElementLength elementLength) {
    if (text.starts_with('[')) return MatrixReader(text, elementLength).read();
    Literal literal;
    literal.place = elementLength(text);
    if (literal.place == 0 || literal.place != text.size()) return literal;
    return {Literal::Complete, text.size(), 1, 1, {text}};
}

}  // namespace cli
