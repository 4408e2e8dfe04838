#include "embedded/services/messages.h"
#include "fileio/printf/escape_sequences.h"
#include "tests/properties/properties.h"
#include "tests/support/raised.h"

#include <algorithm>
#include <cctype>
#include <cstdlib>

namespace properties {
namespace {

struct Converted {
    std::u16string text;
    std::string warning;
};

// Takes a numeric escape's digits from the start of `format`.
Converted numericEscape(std::string& format, bool isHex) {
    const std::string name = isHex ? "Hex" : "Octal";
    const char* const digits = isHex ? "0123456789abcdefABCDEF" : "01234567";
    const std::string taken = format.substr(0, format.find_first_not_of(digits));
    format.erase(0, taken.size());
    const unsigned long value = std::strtoul(taken.c_str(), nullptr, isHex ? 16 : 8);
    if (taken.empty()) return {u"", name + "CharCodeInvalid"};
    if (value > 0xFFFF) return {u"", name + "CharCodeOutOfRange"};
    return {std::u16string(1, static_cast<char16_t>(value)), ""};
}

Converted model(std::string format) {
    const std::string letters = R"(ntfr\'"?abv)", meanings = "\n\t\f\r\\'\"?\a\b\v";
    std::u16string text;
    while (!format.empty()) {
        const char first = format[0];
        format.erase(0, 1);
        if (first != '\\') {
            text += static_cast<char16_t>(first);
            continue;
        }
        if (format.empty()) return {text, "NoControlCharacterInFormat"};
        const char letter = format[0];
        const std::size_t place = letters.find(letter);
        const bool isOctal = std::isdigit(letter) != 0;
        if (!isOctal) format.erase(0, 1);
        if (place != letters.npos) {
            text += static_cast<char16_t>(meanings[place]);
        } else if (isOctal || letter == 'x') {
            const Converted escape = numericEscape(format, !isOctal);
            text += escape.text;
            if (!escape.warning.empty()) return {text, escape.warning};
        } else {
            return {text, std::string("BadEscapeSequenceInFormat ") + letter};
        }
    }
    return {text, ""};
}

}  // namespace

void escapes(Bytes& input) {
    static const std::string parts[] = {"\\",       "\\x",   "\\0",    "\\n",        "\\17777",
                                        "\\200000", "\\xFe", "\\9",    "\\x10000",   "\\d83d",
                                        "\\xd83d",  "\\\\",  "\\x000", "\\777777777"};
    const std::string format = input.text(parts, 60);
    const Converted wanted = model(format);
    const std::u16string units(format.begin(), format.end());
    std::u16string text = units, strict = units;
    Orvandeil::FileIO::embedded::WarningRecorder recorder;
    const bool stopped = builtins::util::convertFormatEscSeqs(text, false);
    std::string warning;
    for (const auto& id : recorder.warnings()) {
        warning += id.GetIdentifier().substr(std::string("KESTRA:printf:").size());
        for (const std::string& argument : id.GetArguments())
            warning += ' ' + argument;
    }
    requireEqual(bytesOf(text) + warning, bytesOf(wanted.text) + wanted.warning, format);
    requireEqual(std::to_string(stopped), std::to_string(!warning.empty()), format);
    input.observe(bytesOf(text) + warning);
    // Only the unknown escape is ever an error, and then the format stays.
    const bool isUnknown = wanted.warning.starts_with("Bad");
    const std::string raised =
        fileio_tests::raisedBy([&] { builtins::util::convertFormatEscSeqs(strict, true); });
    requireEqual(raised, isUnknown ? "KESTRA:printf:" + warning : "", format + " strictly");
    requireEqual(bytesOf(strict), bytesOf(isUnknown ? units : text), format + " strictly");
    if (text.find(u'\\') != text.npos) return;
    const std::u16string once = text;
    builtins::util::convertFormatEscSeqs(text, true);
    requireEqual(bytesOf(text), bytesOf(once), format + " once more");
}

}  // namespace properties
