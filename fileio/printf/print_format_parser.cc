#include "fileio/printf/print_format_parser.h"

#include "fileio/errors/code_list.h"
#include "fileio/host/text.h"
#include "fileio/printf/escape_sequences.h"
#include "fileio/text/tcodn_stream.h"

#include <algorithm>
#include <stdexcept>

namespace Orvandeil::FileIO {
namespace {

// The number that a digit run inside the format begins with.
int decimalAt(std::u16string_view text) {
    char16_t* end;
    return scanUTF16Decimal(text.data(), &end);
}

// Each flag's bit is its place in this list, each modifier's number its place in the next, from 1.
constexpr std::u16string_view flagLetters = u"-+ #0";
constexpr std::u16string_view modifierLetters = u"hltb";

PrintFormatFlags flagOf(char16_t letter) {
    return static_cast<PrintFormatFlags>(1 << flagLetters.find(letter));
}

PrintfSubformat modifierOf(std::u16string_view modifier) {
    if (modifier.empty()) return NoSubformat;
    return static_cast<PrintfSubformat>(modifierLetters.find(modifier.front()) + 1);
}

struct Conversion {
    char16_t letter;
    PrintfFormat kind;
    PrintfSubformat lastModifier;  // of those that it allows, in the order of their numbers

    bool isInteger() const { return lastModifier != NoSubformat; }
};

constexpr Conversion conversions[] = {
    {u'd', ConvD, SubL},        {u'i', ConvI, SubL},        {u'o', ConvO, SubB},
    {u'u', ConvU, SubB},        {u'x', ConvX, SubB},        {u'X', ConvX, SubB},
    {u'e', ConvE, NoSubformat}, {u'E', ConvE, NoSubformat}, {u'f', ConvF, NoSubformat},
    {u'g', ConvG, NoSubformat}, {u'G', ConvG, NoSubformat}, {u's', ConvS, NoSubformat},
    {u'c', ConvC, NoSubformat},
};

const Conversion& conversionOf(char16_t letter) {
    return *std::ranges::find(conversions, letter, &Conversion::letter);
}

}  // namespace

PrintFormatParser::PrintFormatParser(std::u16string format, bool signForced)
    : formatText(std::move(format)), formatCharacters(formatText.c_str()), forceSign(signForced) {
    pieces.reserve(16);
    if (formatText.empty()) {
        recordInvalidFormat();
    } else {
        parse();
    }
}

PrintFormatParser::~PrintFormatParser() = default;

foutFormatPiece* PrintFormatParser::getNextPrintFormatPiece() {
    if (nextPiece < pieces.size()) return pieces[nextPiece++].get();
    if (recordedError != 0) throw recordedError;
    return nullptr;
}

void PrintFormatParser::resetParser() {
    if (argumentType != ArgumentsNumbered) nextPiece = 0;
}

bool PrintFormatParser::trailingWhitespaceIsLeftJustification() const {
    if (!lastLeftJustified) return false;
    if (trailingLiteral == nullptr) return true;
    return std::all_of(trailingLiteral, formatCharacters + formatText.size(), qzu_isbreakablespace);
}

void PrintFormatParser::printRemainingFormatAsLiteral(TcodnStream* out) const {
    if (nextPiece == 0) throw std::out_of_range("no piece of the format was taken yet");
    const unsigned long position = pieces[nextPiece - 1]->getFormatPosition();
    const std::u16string rest = formatText.substr(position);
    if (out->PutString(rest) < rest.size()) throw out->getErrorCode();
}

void PrintFormatParser::parse() {
    std::size_t position = 0;
    while (position < formatText.size()) {
        const std::size_t percent = formatText.find(u'%', position);
        if (percent == formatText.npos) {
            trailingLiteral = formatCharacters + position;
            pushLiteral(position, formatText.size(), position);
            return;
        }
        if (position < percent) pushLiteral(position, percent, percent);
        parseConversion(percent);
        if (recordedError != 0) return;
        position = percent + match.whole.size();
    }
}

void PrintFormatParser::parseConversion(std::size_t position) {
    match = detail::tokenizeConversion(formatText, position);
    subformatText += u'%';
    if (!specialCasePercent()) {
        extractNumberedArgPart();
        extractFlagsPart();
        extractWidthPart();
        extractPrecisionPart();
        extractSubFormatPart();
        extractFormatPart();
        ++conversionCount;
    }
    if (recordedError == 0) pushFormat(position);
}

// True when nothing is left to extract: "%%", and what is no conversion at all.
bool PrintFormatParser::specialCasePercent() {
    if (match.conversion.empty()) {
        recordInvalidFormat();
        return true;
    }
    if (match.conversion != u"%") return false;
    if (match.whole.size() != 2) recordInvalidFormat();
    return true;
}

void PrintFormatParser::extractNumberedArgPart() {
    if (match.numbered.empty()) {
        setArgumentType(ArgumentsSequential);
        return;
    }
    setArgumentType(ArgumentsNumbered);
    numberedIndex = static_cast<unsigned int>(decimalAt(match.numbered));
}

void PrintFormatParser::extractFlagsPart() {
    for (const char16_t character : match.flags) {
        const PrintFormatFlags flag = flagOf(character);
        if (flags & flag) {
            recordInvalidFormat();
            return;
        }
        flags = flags | flag;
    }
    lastLeftJustified = flags & LeftJustify;
    if (forceSign && !(flags & ShowSign)) {
        subformatText += u'+';
        flags = flags | ShowSign;
    }
    subformatText += match.flags;
}

void PrintFormatParser::extractWidthPart() {
    if (forceSign || match.width.empty()) return;
    if (match.width.front() == u'*') {
        widthKind = extractReference(match.width.substr(1), widthValue);
        subformatText += u'*';
    } else {
        // The text keeps digits that the value cannot hold: printf refuses such a width itself.
        widthKind = FieldLiteral;
        widthValue = decimalAt(match.width);
        subformatText += match.width;
    }
}

void PrintFormatParser::extractPrecisionPart() {
    if (match.precision.empty()) return;
    const std::u16string_view digits = match.precision.substr(1);
    if (!digits.empty() && digits.front() == u'*') {
        precisionKind = extractReference(digits.substr(1), precisionValue);
        subformatText += u".*";
        return;
    }
    const int value = decimalAt(digits);
    if (value < 0) return;
    precisionKind = FieldLiteral;
    precisionValue = value;
    // ".-" and ".-0" say precision 0, in a form that printf does not know.
    const bool hasSign = !digits.empty() && digits.front() == u'-';
    subformatText += hasSign ? std::u16string_view(u".") : match.precision;
}

WidthPrecisionFieldType PrintFormatParser::extractReference(std::u16string_view digits,
                                                            int& number) {
    if (digits.empty()) {
        setArgumentType(ArgumentsSequential);
        ++conversionCount;
        return FieldNextArgument;
    }
    number = decimalAt(digits);
    setArgumentType(ArgumentsNumbered);
    return FieldNumberedArgument;
}

void PrintFormatParser::extractSubFormatPart() {
    subformat = modifierOf(match.modifier);
}

void PrintFormatParser::extractFormatPart() {
    const Conversion& found = conversionOf(match.conversion.front());
    conversion = found.kind;
    hasStringConversion = hasStringConversion || conversion == ConvS;
    if (subformat > found.lastModifier) recordInvalidFormat();
    if (conversion == ConvC && precisionKind != FieldAbsent) recordInvalidFormat();
    // Whole numbers are always 64 bits wide, whatever modifier was written.
    if (found.isInteger()) subformatText += u"ll";
    subformatText += match.conversion;
}

// Numbered and sequential references do not mix within one format.
void PrintFormatParser::setArgumentType(PrintFormatArgumentType type) {
    if (argumentType == ArgumentsNone) {
        argumentType = type;
    } else if (argumentType != type) {
        recordInvalidFormat();
    }
}

void PrintFormatParser::pushLiteral(std::size_t from, std::size_t to, std::size_t position) {
    subformatText.append(formatText, from, to - from);
    pushFormat(position);
}

void PrintFormatParser::pushFormat(unsigned long position) {
    pieces.emplace_back(foutFormatPiece::createFoutFormatPiece(
        conversion, subformat, numberedIndex, flags, widthKind, widthValue, precisionKind,
        precisionValue, subformatText, forceSign, position));
    resetStateForNextPiece();
}

void PrintFormatParser::resetStateForNextPiece() {
    numberedIndex = 0;
    flags = NoFlags;
    widthValue = 0;
    widthKind = FieldAbsent;
    precisionValue = 0;
    precisionKind = FieldAbsent;
    subformat = NoSubformat;
    conversion = NoConversion;
    subformatText.clear();
}

void PrintFormatParser::recordInvalidFormat() {
    recordedError = code::InvalidFormat;
}

}  // namespace Orvandeil::FileIO
