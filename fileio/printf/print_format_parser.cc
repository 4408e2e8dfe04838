#include "fileio/printf/print_format_parser.h"

#include "fileio/errors/code_list.h"
#include "fileio/host/text.h"
#include "fileio/printf/escape_sequences.h"
#include "fileio/text/tcodn_stream.h"

#include <algorithm>
#include <array>
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
    PrintfFormat kind = NoConversion;
    PrintfSubformat lastModifier = NoSubformat;  // of those that it allows, in numerical order
};

// By letter.
consteval std::array<Conversion, 128> makeConversions() {
    std::array<Conversion, 128> all{};
    const auto add = [&all](std::string_view letters, PrintfFormat kind, PrintfSubformat last) {
        for (const char letter : letters)
            all[static_cast<std::size_t>(letter)] = {kind, last};
    };
    add("d", ConvD, SubL);
    add("i", ConvI, SubL);
    add("o", ConvO, SubB);
    add("u", ConvU, SubB);
    add("xX", ConvX, SubB);
    add("eE", ConvE, NoSubformat);
    add("f", ConvF, NoSubformat);
    add("gG", ConvG, NoSubformat);
    add("s", ConvS, NoSubformat);
    add("c", ConvC, NoSubformat);
    return all;
}
constexpr std::array<Conversion, 128> conversions = makeConversions();

}  // namespace

PrintFormatParser::PrintFormatParser(std::u16string format, bool signForced)
    : formatText(std::move(format)), formatCharacters(formatText.c_str()), forceSign(signForced) {
    if (formatText.empty()) {
        recordInvalidFormat();
    } else {
        parse();
    }
}

PrintFormatParser::~PrintFormatParser() = default;

foutFormatPiece* PrintFormatParser::getNextPrintFormatPiece() {
    if (nextPiece < blocks.size()) return getPieces()[nextPiece++];
    if (recordedError != 0) throw recordedError;
    return nullptr;
}

std::span<foutFormatPiece* const> PrintFormatParser::getPieces() {
    while (pieces.size() < blocks.size())
        foutFormatPiece::createFoutFormatPiece(pieces, blocks[pieces.size()]);
    return pieces.all();
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
    const unsigned long position = blocks[nextPiece - 1].formatPosition;
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
        position = parseConversion(percent);
        if (recordedError != 0) return;
    }
}

// Returns the place behind it.
std::size_t PrintFormatParser::parseConversion(std::size_t position) {
    const detail::ConversionToken token = detail::tokenizeConversion(formatText, position);
    beginPiece(position);
    match = &token;
    if (specialCasePercent()) {
        piece->written = token.conversion;
    } else {
        piece->written = token.whole;
        extractNumberedArgPart();
        extractFlagsPart();
        extractWidthPart();
        extractPrecisionPart();
        extractSubFormatPart();
        extractFormatPart();
        ++conversionCount;
    }
    match = nullptr;
    if (recordedError != 0) blocks.pop_back();
    return position + token.whole.size();
}

// True when nothing is left to extract: "%%", and what is no conversion at all.
bool PrintFormatParser::specialCasePercent() {
    if (match->conversion.empty()) {
        recordInvalidFormat();
        return true;
    }
    if (match->conversion != u"%") return false;
    if (match->whole.size() != 2) recordInvalidFormat();
    return true;
}

void PrintFormatParser::extractNumberedArgPart() {
    if (match->numbered.empty()) {
        setArgumentType(ArgumentsSequential);
        return;
    }
    setArgumentType(ArgumentsNumbered);
    piece->numberedIndex = static_cast<unsigned long>(decimalAt(match->numbered));
}

void PrintFormatParser::extractFlagsPart() {
    for (const char16_t character : match->flags) {
        const PrintFormatFlags flag = flagOf(character);
        if (piece->flags & flag) {
            recordInvalidFormat();
            return;
        }
        piece->flags = piece->flags | flag;
    }
    lastLeftJustified = piece->flags & LeftJustify;
    if (forceSign) piece->flags = piece->flags | ShowSign;
}

void PrintFormatParser::extractWidthPart() {
    if (forceSign || match->width.empty()) return;
    if (match->width.front() == u'*') {
        piece->widthKind = extractReference(match->width.substr(1), piece->width);
    } else {
        piece->widthKind = FieldLiteral;
        piece->width = decimalAt(match->width);
    }
}

void PrintFormatParser::extractPrecisionPart() {
    if (match->precision.empty()) return;
    const std::u16string_view digits = match->precision.substr(1);
    if (!digits.empty() && digits.front() == u'*') {
        piece->precisionKind = extractReference(digits.substr(1), piece->precision);
        return;
    }
    const int value = decimalAt(digits);
    if (value < 0) return;
    piece->precisionKind = FieldLiteral;
    piece->precision = value;
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
    piece->subformat = modifierOf(match->modifier);
}

void PrintFormatParser::extractFormatPart() {
    const Conversion& found = conversions[match->conversion.front()];
    piece->conversion = found.kind;
    hasStringConversion = hasStringConversion || piece->conversion == ConvS;
    if (piece->subformat > found.lastModifier) recordInvalidFormat();
    if (piece->conversion == ConvC && piece->precisionKind != FieldAbsent) recordInvalidFormat();
}

// Numbered and sequential references do not mix within one format.
void PrintFormatParser::setArgumentType(PrintFormatArgumentType type) {
    if (argumentType == ArgumentsNone) {
        argumentType = type;
    } else if (argumentType != type) {
        recordInvalidFormat();
    }
}

void PrintFormatParser::beginPiece(unsigned long position) {
    piece = &blocks.emplace_back();
    piece->forceSign = forceSign;
    piece->formatPosition = position;
}

void PrintFormatParser::pushLiteral(std::size_t from, std::size_t to, std::size_t position) {
    beginPiece(position);
    piece->written = std::u16string_view(formatText).substr(from, to - from);
}

void PrintFormatParser::recordInvalidFormat() {
    recordedError = code::InvalidFormat;
}

}  // namespace Orvandeil::FileIO
