#include "fileio/printf/escape_sequences.h"

#include "fileio/errors/identifiers.h"
#include "fileio/host/messages.h"
#include "fileio/host/text.h"
#include "fileio/printf/digits.h"

#include <algorithm>
#include <cstddef>
#include <utility>

namespace builtins::util {
namespace {

using Orvandeil::FileIO::detail::digitValue;
using Orvandeil::FileIO::detail::isDecimalDigit;
using Orvandeil::FileIO::detail::isHexDigit;

bool belongsTo(int base, int digit) {
    if (digit < 8) return true;
    return digit < 10 ? base >= 9 : digit < 16 && base >= 11;
}

struct SimpleEscape {
    char16_t escape;
    char16_t result;
};

constexpr SimpleEscape simpleEscapes[] = {
    {u'n', u'\n'}, {u't', u'\t'}, {u'f', u'\f'}, {u'r', u'\r'}, {u'\\', u'\\'}, {u'\'', u'\''},
    {u'"', u'"'},  {u'?', u'?'},  {u'a', u'\a'}, {u'b', u'\b'}, {u'v', u'\v'},
};

template <class Id>
void warn() {
    vxWarningMsgId(Id());
}

struct CharacterCode {
    int base;
    void (*warnInvalid)();
    void (*warnOutOfRange)();
};

constexpr CharacterCode octalCode = {8, warn<KESTRA::printf::OctalCharCodeInvalid>,
                                     warn<KESTRA::printf::OctalCharCodeOutOfRange>};
constexpr CharacterCode hexCode = {16, warn<KESTRA::printf::HexCharCodeInvalid>,
                                   warn<KESTRA::printf::HexCharCodeOutOfRange>};

// The first character of a text as narrow text; "?" for half a surrogate pair.
std::string firstCharacter(const char16_t* text) {
    const auto isHalf = [](char16_t unit, int from) { return (unit & 0xFC00) == from; };
    if (isHalf(text[0], 0xD800) && isHalf(text[1], 0xDC00)) return vxTextToNarrow(text, 2);
    return (text[0] & 0xF800) == 0xD800 ? "?" : vxTextToNarrow(text, 1);
}

class EscapeConverter {
public:
    EscapeConverter(const std::u16string& format, bool unknownIsError)
        : next(format.data()), end(next + format.size()), unknownRaises(unknownIsError) {
        converted.reserve(format.size());
    }

    // False when it stopped after a warning.
    bool run() {
        while (true) {
            const char16_t* backslash = std::find(next, end, u'\\');
            converted.append(next, backslash);
            if (backslash == end) return true;
            next = backslash + 1;
            if (!convertEscape()) return false;
        }
    }

    std::u16string takeConverted() { return std::move(converted); }

private:
    bool convertEscape() {
        if (next == end) {
            warn<KESTRA::printf::NoControlCharacterInFormat>();
            return false;
        }
        if (isDecimalDigit(*next)) return convertCode(octalCode);
        if (*next == u'x') {
            ++next;
            return convertCode(hexCode);
        }
        return convertSimple();
    }

    // The digits are gathered as hexadecimal in either base; what the base does not take stays in
    // the input as ordinary text.
    bool convertCode(const CharacterCode& code) {
        char16_t* behind = nullptr;
        const int value = isHexDigit(*next) ? scanUTF16Value(next, &behind, code.base) : 0;
        if (behind == nullptr || behind == next) {
            code.warnInvalid();
            return false;
        }
        if (value > 0xFFFF) {
            code.warnOutOfRange();
            return false;
        }
        converted += static_cast<char16_t>(value);
        next = behind;
        return true;
    }

    bool convertSimple() {
        for (const SimpleEscape& simple : simpleEscapes) {
            if (simple.escape != *next) continue;
            converted += simple.result;
            ++next;
            return true;
        }
        const KESTRA::printf::BadEscapeSequenceInFormat unknown(firstCharacter(next));
        if (unknownRaises) vxErrMsgId(unknown);
        vxWarningMsgId(unknown);
        return false;
    }

    const char16_t* next;
    const char16_t* end;
    bool unknownRaises;
    std::u16string converted;
};

}  // namespace

int scanUTF16Value(const char16_t* text, char16_t** end, int base) {
    constexpr long limit = 2147483648;
    const bool negative = *text == u'-';
    const char16_t* const digits = text + (negative ? 1 : 0);
    const char16_t* next = digits;
    long value = 0;
    for (int digit = digitValue(*next); belongsTo(base, digit); digit = digitValue(*++next)) {
        value = std::min(value * base + digit, limit);
    }
    *end = const_cast<char16_t*>(next == digits ? text : next);
    if (negative) return static_cast<int>(-value);
    return static_cast<int>(std::min(value, limit - 1));
}

bool convertFormatEscSeqs(std::u16string& format, bool escapeErrorsAreErrors) {
    EscapeConverter converter(format, escapeErrorsAreErrors);
    const bool complete = converter.run();
    format = converter.takeConverted();
    return !complete;
}

}  // namespace builtins::util

namespace Orvandeil::FileIO {

int scanUTF16Octal(const char16_t* text, char16_t** end) {
    return builtins::util::scanUTF16Value(text, end, 8);
}

int scanUTF16Decimal(const char16_t* text, char16_t** end) {
    return builtins::util::scanUTF16Value(text, end, 10);
}

int scanUTF16Hex(const char16_t* text, char16_t** end) {
    return builtins::util::scanUTF16Value(text, end, 16);
}

}  // namespace Orvandeil::FileIO
