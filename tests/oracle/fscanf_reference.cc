#include "tests/oracle/fscanf_reference.h"

#include <algorithm>
#include <cerrno>
#include <cmath>
#include <cstdlib>
#include <cstring>

namespace oracle {
namespace {

const std::string decimalSet = "[0123456789]";
const std::string octalSet = "[01234567]";
const std::string hexSet = "[0123456789abcdefABCDEF]";

bool isSign(int c) {
    return c == '-' || c == '+';
}

unsigned long bitsOf(double value) {
    unsigned long bits = 0;
    std::memcpy(&bits, &value, sizeof bits);
    return bits;
}

Outcome convert(Operation operation, const std::string& field) {
    Outcome out;
    const char* text = field.c_str();
    errno = 0;
    switch (operation) {
        case Integer:
            out.bits = static_cast<unsigned long>(std::strtoll(text, nullptr, 10));
            return out;
        case CouldBeHex:
            out.bits = static_cast<unsigned long>(std::strtoll(text, nullptr, 0));
            return out;
        case Hex:
            out.bits = std::strtoull(text, nullptr, 16);
            out.flag = text[0] == '-';
            return out;
        default:
            out.bits = std::strtoull(text, nullptr, operation == Octal ? 8 : 10);
            out.flag = text[0] == '-' && out.bits != 0;
            if (out.flag && errno == ERANGE) out.bits = 0;
            return out;
    }
}

}  // namespace

int FscanfReference::nextBehindBlanks() {
    int c;
    do {
        c = std::getc(file);
    } while (c != EOF && std::strchr(" \t\n\v\f\r", c) && c != 0);
    return c;
}

void FscanfReference::giveBack(std::string read) {
    for (; !read.empty(); read.pop_back())
        std::ungetc(static_cast<unsigned char>(read.back()), file);
}

int FscanfReference::failureCode() {
    return errorCode = errno != 0 ? errno : std::ferror(file) ? -1 : 0;
}

long FscanfReference::skip(long width, const std::string& set) {
    const std::string digits = width < 0 ? "" : std::to_string(std::min<long>(width, INT_MAX));
    int taken = 0;
    if (std::fscanf(file, ("%*" + digits + set + "%n").c_str(), &taken) == EOF) return 0;
    return taken;
}

bool FscanfReference::read(long width, const std::string& set, std::string& field) {
    char digits[64];
    int taken = 0;
    errno = 0;
    const std::string format = "%" + std::to_string(width) + set + "%n";
    if (std::fscanf(file, format.c_str(), digits, &taken) != 1) return false;
    field += digits;
    return true;
}

Outcome FscanfReference::integer(Operation operation, long width) {
    std::string field;
    if (collect(operation, width, field)) return convert(operation, field);
    Outcome out;
    out.flag = operation == Hex && field[0] == '-';
    giveBack(field);
    out.status = failureCode();
    return out;
}

bool FscanfReference::collect(Operation operation, long width, std::string& field) {
    errno = 0;
    int c = nextBehindBlanks();
    if (isSign(c)) {
        field += static_cast<char>(c);
        c = std::getc(file);
    }
    const bool zero = c == '0';
    std::string set = operation == Octal ? octalSet : operation == Hex ? hexSet : decimalSet;
    bool skipZeros = zero;
    if (!zero) {
        std::ungetc(c, file);
    } else {
        field += '0';
        if (operation == Hex || operation == CouldBeHex) {
            c = std::getc(file);
            const bool prefix = c == 'x' || c == 'X';
            if (prefix) {
                field += static_cast<char>(c);
            } else {
                std::ungetc(c, file);
            }
            if (operation == CouldBeHex) set = prefix ? hexSet : octalSet;
            if (operation == Hex && prefix) skipZeros = false;
        }
    }

    const long kept = static_cast<long>(field.size());
    if (width < 0) {
        if (skipZeros) skip(-1, "[0]");
        if (!read(22, set, field)) return zero;
        skip(-1, set);
        return true;
    }
    if (width <= 24) {
        if (width < kept || (width == kept && !zero)) return false;
        return width == kept || read(width - kept, set, field) || zero;
    }
    long surplus = width - 24;
    if (skipZeros) surplus -= skip(surplus, "[0]");
    if (!read(24 - kept, set, field)) return zero;
    if (surplus > 0) skip(surplus, set);
    return true;
}

Outcome FscanfReference::floating(long width, int status) {
    errno = 0;
    std::string field;
    int c = nextBehindBlanks();
    const int sign = isSign(c) ? c : 0;
    if (sign != 0) {
        field += static_cast<char>(c);
        c = std::getc(file);
    }
    const std::string word = c == 'i' || c == 'I' ? "inf" : c == 'n' || c == 'N' ? "nan" : "";
    if (c != EOF) field += static_cast<char>(c);
    bool matches = !word.empty();
    for (std::size_t i = 1; matches && i < word.size(); ++i) {
        c = std::getc(file);
        if (c != EOF) field += static_cast<char>(c);
        matches = c == word[i] || c == word[i] - 'a' + 'A';
    }
    Outcome out;
    out.status = status;
    if (matches && status == INT_MAX) {
        const double infinity = sign == '-' ? -INFINITY : INFINITY;
        out.bits = word == "inf" ? bitsOf(infinity) : 0xFFF8000000000000;
        return out;
    }
    giveBack(field);
    if (!word.empty() && !matches) out.status = -1;
    if (word.empty() || out.status == 0) return floatingNumber(width, sign);
    out.bits = bitsOf(-1.0);
    return out;
}

Outcome FscanfReference::floatingNumber(long width, int sign) {
    Outcome out;
    errno = 0;
    double value = 0;
    if (width != 0) {
        const std::string digits = width < 0 ? "" : std::to_string(std::min<long>(width, INT_MAX));
        if (std::fscanf(file, ("%" + digits + "le").c_str(), &value) == 1) {
            out.bits = bitsOf(value);
            return out;
        }
        if (sign != 0) std::ungetc(sign, file);
    }
    out.status = failureCode();
    return out;
}

Outcome FscanfReference::scan(Operation operation, long width, int status) {
    return operation == Float ? floating(width, status) : integer(operation, width);
}

}  // namespace oracle
