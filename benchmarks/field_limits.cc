#include "benchmarks/field_limits.h"

#include <charconv>
#include <cstdint>

namespace bench {
namespace {

bool isSeparator(char c) {
    return c <= ' ' || c == ',';
}

struct IntegerField {
    static const char* parse(const char* text, const char* end, double& value) {
        long whole = 0;
        const char* const behind = std::from_chars(text, end, whole).ptr;
        value = static_cast<double>(whole);
        return behind;
    }
};

struct RealField {
    static const char* parse(const char* text, const char* end, double& value) {
        const char* const behind = std::from_chars(text, end, value).ptr;
        return behind == text ? end : behind;  // a sign alone, cut off by the end
    }
};

// By hand, where <charconv> is not the fastest.
struct PlainIntegerField {
    static const char* parse(const char* text, const char* end, double& value) {
        const bool isNegative = *text == '-';
        text += isNegative;
        std::int64_t whole = 0;
        for (; text != end && *text >= '0'; ++text)
            whole = 10 * whole + (*text - '0');
        value = static_cast<double>(isNegative ? -whole : whole);
        return text;
    }
};

// Exact as long as digits and power of ten are; else <charconv> reads it again.
struct PlainRealField {
    static const char* parse(const char* text, const char* end, double& value) {
        static constexpr double powers[] = {1e0,  1e1,  1e2,  1e3,  1e4,  1e5,  1e6,
                                            1e7,  1e8,  1e9,  1e10, 1e11, 1e12, 1e13,
                                            1e14, 1e15, 1e16, 1e17, 1e18};
        const char* const begin = text;
        const bool isNegative = *text == '-';
        text += isNegative;
        const char* const digits = text;
        std::int64_t whole = 0;
        for (; text != end && *text >= '0'; ++text)
            whole = 10 * whole + (*text - '0');
        std::ptrdiff_t decimals = 0;
        if (text != end && *text == '.') {
            const char* const point = text;
            for (++text; text != end && *text >= '0'; ++text)
                whole = 10 * whole + (*text - '0');
            decimals = text - point - 1;
        }
        if (text - digits > 19 || whole > std::int64_t{1} << 53)
            return std::from_chars(begin, end, value).ptr;
        value = static_cast<double>(isNegative ? -whole : whole) / powers[decimals];
        return text;
    }
};

template <class Field>
std::size_t fieldsOf(std::string_view text, double* out) {
    double* const begin = out;
    const char* next = text.data();
    const char* const end = next + text.size();
    for (;;) {
        while (next != end && isSeparator(*next))
            ++next;
        if (next == end) return static_cast<std::size_t>(out - begin);
        next = Field::parse(next, end, *out++);
    }
}

// A field that reaches the end of the buffer.
template <class Field>
void parseAcross(std::FILE* file, double& value) {
    char field[64];
    char* end = field;
    int c;
    while ((c = getc_unlocked(file)) != EOF && !isSeparator(static_cast<char>(c)))
        *end++ = static_cast<char>(c);
    ungetc(c, file);
    Field::parse(field, end, value);
}

// Fills the buffer when it is empty; false at the end of the file.
bool refill(std::FILE* file) {
    if (file->_IO_read_ptr != file->_IO_read_end) return true;
    const int c = getc_unlocked(file);
    ungetc(c, file);
    return c != EOF;
}

template <class Field>
std::size_t fieldsOf(std::FILE* file, double* out) {
    double* const begin = out;
    while (refill(file)) {
        const char* next = file->_IO_read_ptr;
        const char* const end = file->_IO_read_end;
        while (next != end && isSeparator(*next))
            ++next;
        const char* behind = next;
        while (next != end && (behind = Field::parse(next, end, *out)) != end) {
            ++out;
            next = behind;
            while (next != end && isSeparator(*next))
                ++next;
        }
        file->_IO_read_ptr = const_cast<char*>(next);
        if (next != end) parseAcross<Field>(file, *out++);
    }
    return static_cast<std::size_t>(out - begin);
}

}  // namespace

std::size_t integersOf(std::string_view text, double* out) {
    return fieldsOf<IntegerField>(text, out);
}

std::size_t realsOf(std::string_view text, double* out) {
    return fieldsOf<RealField>(text, out);
}

std::size_t shortRealsOf(std::string_view text, double* out) {
    return realsOf(text, out);
}

std::size_t wordsOf(std::string_view text, char16_t* out) {
    char16_t* const begin = out;
    for (const char c : text) {
        *out = static_cast<char16_t>(c);
        out += isSeparator(c) ? 0 : 1;
    }
    return static_cast<std::size_t>(out - begin);
}

std::size_t integersOf(std::FILE* file, double* out) {
    return fieldsOf<PlainIntegerField>(file, out);
}

std::size_t realsOf(std::FILE* file, double* out) {
    return fieldsOf<RealField>(file, out);
}

std::size_t shortRealsOf(std::FILE* file, double* out) {
    return fieldsOf<PlainRealField>(file, out);
}

std::size_t wordsOf(std::FILE* file, char16_t* out) {
    char16_t* const begin = out;
    while (refill(file)) {
        const char* const next = file->_IO_read_ptr;
        const auto count = static_cast<std::size_t>(file->_IO_read_end - next);
        out += wordsOf(std::string_view(next, count), out);
        file->_IO_read_ptr = file->_IO_read_end;
    }
    return static_cast<std::size_t>(out - begin);
}

}  // namespace bench
