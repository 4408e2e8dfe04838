#include "cli/explain.h"
#include "cli/format_argument.h"
#include "cli/format_place.h"
#include "fileio/printf/fout_format_pieces.h"
#include "fileio/printf/print_format_parser.h"

#include <array>

namespace cli {

using namespace Orvandeil::FileIO;

namespace {

// By PrintfFormat.
constexpr std::array<const char*, 11> conversionNames = {"literal text",
                                                         "a whole number",
                                                         "a whole number",
                                                         "an octal number",
                                                         "an unsigned number",
                                                         "a hexadecimal number",
                                                         "a number in exponent form",
                                                         "a number in fixed point",
                                                         "a number in the shorter of both forms",
                                                         "text",
                                                         "a character"};

struct FlagName {
    PrintFormatFlags flag;
    const char* name;
};

constexpr FlagName flagNames[] = {
    {LeftJustify, "left-justified"}, {ShowSign, "always signed"},
    {SpaceSign, "blank for a plus"}, {Alternate, "alternate form"},
    {ZeroPad, "filled with zeros"},
};

std::string fieldWords(const char* name, WidthPrecisionFieldType kind, int value) {
    switch (kind) {
        case FieldLiteral:
            return std::string(", ") + name + ' ' + std::to_string(value);
        case FieldNumberedArgument:
            return std::string(", ") + name + " from argument " + std::to_string(value);
        case FieldNextArgument:
            return std::string(", ") + name + " from the next argument";
        default:
            return {};
    }
}

std::string conversionWords(const foutFormatPiece& piece) {
    std::string words = conversionNames[static_cast<std::size_t>(piece.getConversion())];
    if (piece.getSubformat() == SubB) words += " from the bits of a double";
    if (piece.getSubformat() == SubT) words += " from the bits of a single";
    if (piece.getNumberedIndex() != 0) {
        words += ", argument " + std::to_string(piece.getNumberedIndex());
    }
    for (const FlagName& known : flagNames) {
        if (piece.getFlags() & known.flag) words += std::string(", ") + known.name;
    }
    words += fieldWords("width", piece.getWidthKind(), piece.getWidthValue());
    return words + fieldWords("precision", piece.getPrecisionKind(), piece.getPrecisionValue());
}

void writePiece(JsonWriter& json, const foutFormatPiece& piece) {
    json.startObject();
    if (piece.getConversion() == NoConversion) {
        json.key("literal").value(literalTextOf(piece));
    } else {
        json.key("conversion").value(static_cast<int>(piece.getConversion()));
        json.key("subformat").value(static_cast<int>(piece.getSubformat()));
        json.key("flags").value(static_cast<int>(piece.getFlags()));
        json.key("numbered").value(piece.getNumberedIndex());
        json.key("widthKind").value(static_cast<int>(piece.getWidthKind()));
        json.key("width").value(piece.getWidthValue());
        json.key("precisionKind").value(static_cast<int>(piece.getPrecisionKind()));
        json.key("precision").value(piece.getPrecisionValue());
        json.key("printf").value(piece.getPrintfText());
    }
    json.endObject();
}

// Calls use(piece) with every piece in front of the recorded error.
template <class Use>
void forEachPiece(PrintFormatParser& parser, Use use) {
    try {
        while (const foutFormatPiece* piece = parser.getNextPrintFormatPiece())
            use(*piece);
    } catch (int) {
        // The same code is kept as the parser's recorded error.
    }
}

void explainAsJson(PrintFormatParser& parser, Report& report) {
    report.key("argumentType", static_cast<int>(parser.getArgumentType()));
    report.key("conversions", parser.getConversionCount());
    JsonWriter& json = report.object();
    json.key("pieces").startList();
    forEachPiece(parser, [&json](const foutFormatPiece& piece) { writePiece(json, piece); });
    json.endList();
}

void explainInWords(const std::u16string& format, PrintFormatParser& parser, Report& report) {
    forEachPiece(parser, [&](const foutFormatPiece& piece) {
        const bool isLiteral = piece.getConversion() == NoConversion;
        report.print(isLiteral ? "prints " + quoted(literalTextOf(piece)) + '\n'
                               : pieceText(format, piece) + "  " + conversionWords(piece) + '\n');
    });
    if (parser.getRecordedError() == 0) return;
    const std::string place = malformedPlace(format);
    report.print("malformed" + (place.empty() ? ": the format is empty" : ": " + place) + '\n');
}

}  // namespace

void explainOutputFormat(const std::string& text, const CommandLine& line, Report& report) {
    const std::u16string format = readFormat(text, line.has("raw"));
    PrintFormatParser parser(format, false);
    if (report.isJson()) {
        explainAsJson(parser, report);
        if (parser.getRecordedError() != 0) report.note(parser.getRecordedError());
    } else {
        explainInWords(format, parser, report);
    }
}

}  // namespace cli
