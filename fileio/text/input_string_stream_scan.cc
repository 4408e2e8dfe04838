#include "fileio/errors/code_list.h"
#include "fileio/host/text.h"
#include "fileio/streams/scan_operation.h"
#include "fileio/text/input_string_stream.h"

#include <algorithm>
#include <climits>
#include <cstdio>

namespace Orvandeil::FileIO {
namespace {

bool isBlank(char byte) {
    // Sign-extended, so that the bytes of a character beyond ASCII are never blanks.
    return byte == '\0' ||
           qzu_isbreakablespace(static_cast<char16_t>(static_cast<signed char>(byte)));
}

bool beginsHexFloat(std::string_view text) {
    if (!text.empty() && (text[0] == '+' || text[0] == '-')) text.remove_prefix(1);
    return text.size() > 1 && text[0] == '0' && (text[1] == 'x' || text[1] == 'X');
}

// Whether the byte may stand in a number as the C library reads it.
bool isNumberByte(char byte) {
    return (byte >= '0' && byte <= '9') || (byte >= 'a' && byte <= 'z') ||
           (byte >= 'A' && byte <= 'Z') || byte == '+' || byte == '-' || byte == '.';
}

// The word at the start of `text`, or of a longer one the part up to the first byte that no number
// goes past, so that a list without blanks is not walked to its end for every number in it.
std::string_view numberWord(std::string_view text) {
    std::size_t n = 0;
    while (n < text.size() && !isBlank(text[n])) {
        if (!isNumberByte(text[n++])) break;
    }
    // An exponent letter at the end of the word is never part of a hexadecimal number. Decimal
    // numbers are treated otherwise; this is on purpose.
    if (n != 0 && (text[n - 1] == 'e' || text[n - 1] == 'E')) --n;
    return text.substr(0, n);
}

}  // namespace

// Skips to the next number and returns its text, cut to the width. At the end of the data there is
// none, and the status is 0.
std::optional<std::string_view> inputStringStream::numberText(long width, int& status) {
    current = std::find_if_not(current, end, isBlank);
    if (current == end) {
        status = 0;
        return std::nullopt;
    }
    auto count = static_cast<std::size_t>(end - current);
    if (width >= 0) count = std::min(count, static_cast<std::size_t>(width));
    return std::string_view(current, count);
}

void inputStringStream::take(std::size_t consumed, int& status) {
    if (consumed == 0) status = code::MatchingFailure;
    current += consumed;
}

long inputStringStream::scanSigned(const detail::IntegerScan& operation, long width, int& status) {
    const std::optional<std::string_view> text = numberText(width, status);
    if (!text) return 0;
    const detail::IntegerField field = detail::parseInteger(*text, operation);
    take(field.consumed, status);
    return field.asSigned();
}

unsigned long inputStringStream::scanUnsigned(const detail::IntegerScan& operation, long width,
                                              int& status, bool& flag) {
    const std::optional<std::string_view> text = numberText(width, status);
    if (!text) return 0;
    const detail::IntegerField field = detail::parseInteger(*text, operation);
    take(field.consumed, status);
    return field.asFlagged(flag);
}

unsigned long inputStringStream::scanOctal(long width, int& status, bool& flag) {
    return scanUnsigned(detail::scan::octal, width, status, flag);
}

unsigned long inputStringStream::scanHex(long width, int& status, bool& flag) {
    return scanUnsigned(detail::scan::hex, width, status, flag);
}

unsigned long inputStringStream::scanUnsignedInteger(long width, int& status, bool& flag) {
    return scanUnsigned(detail::scan::unsignedInteger, width, status, flag);
}

long inputStringStream::scanInteger(long width, int& status) {
    return scanSigned(detail::scan::integer, width, status);
}

long inputStringStream::scanIntegerCouldBeHex(long width, int& status) {
    return scanSigned(detail::scan::integerCouldBeHex, width, status);
}

double inputStringStream::scanFloat(long width, int& status) {
    const std::optional<std::string_view> text = numberText(width, status);
    if (!text) return 0;
    if (beginsHexFloat(*text)) return scanHexFloat(numberWord(*text), status);
    std::size_t consumed = 0;
    const double value = vxTextToDouble(text->data(), text->size(), &consumed);
    take(consumed, status);
    return consumed != 0 ? value : 0;
}

double inputStringStream::scanHexFloat(std::string_view text, int& status) {
    scratch = text;
    // The width shows where the word ends in "0x": with it the zero alone is the number.
    char format[32];
    const auto width = static_cast<int>(std::min(text.size(), std::size_t{INT_MAX}));
    std::snprintf(format, sizeof format, "%%%dle%%n", width);
    double value = 0;
    int consumed = INT_MIN;
    std::sscanf(scratch.c_str(), format, &value, &consumed);
    take(consumed == INT_MIN ? 0 : static_cast<std::size_t>(consumed), status);
    return value;
}

}  // namespace Orvandeil::FileIO
