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

PrintFormatFlags flagOf(char16_t character) {
    switch (character) {
        case u'-':
            return LeftJustify;
        case u'+':
            return ShowSign;
        case u' ':
            return SpaceSign;
        case u'#':
            return Alternate;
        default:
            return ZeroPad;
    }
}

PrintfSubformat modifierOf(std::u16string_view modifier) {
    if (modifier.empty()) return NoSubformat;
    switch (modifier.front()) {
        case u'h':
            return SubH;
        case u'l':
            return SubL;
        case u't':
            return SubT;
        default:
            return SubB;
    }
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
    switch (match.conversion.front()) {
        case u'd':
            extractIntegerFormat(ConvD, false);
            break;
        case u'i':
            extractIntegerFormat(ConvI, false);
            break;
        case u'o':
            extractIntegerFormat(ConvO, true);
            break;
        case u'u':
            extractIntegerFormat(ConvU, true);
            break;
        case u'x':
        case u'X':
            extractIntegerFormat(ConvX, true);
            break;
        case u'e':
        case u'E':
            extractPlainFormat(ConvE);
            break;
        case u'f':
            extractPlainFormat(ConvF);
            break;
        case u'g':
        case u'G':
            extractPlainFormat(ConvG);
            break;
        case u's':
            extractPlainFormat(ConvS);
            hasStringConversion = true;
            break;
        default:
            extractPlainFormat(ConvC);
            if (precisionKind != FieldAbsent) recordInvalidFormat();
            break;
    }
    subformatText += match.conversion;
}

void PrintFormatParser::extractIntegerFormat(PrintfFormat kind, bool bitPatternAllowed) {
    conversion = kind;
    if (!bitPatternAllowed && (subformat == SubT || subformat == SubB)) recordInvalidFormat();
    // Values are always 64 bits wide, whatever modifier was written.
    subformatText += u"ll";
}

void PrintFormatParser::extractPlainFormat(PrintfFormat kind) {
    conversion = kind;
    if (subformat != NoSubformat) recordInvalidFormat();
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
