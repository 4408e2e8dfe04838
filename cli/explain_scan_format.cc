#include "cli/explain.h"
#include "cli/format_place.h"
#include "embedded/services/array.h"
#include "fileio/host/text.h"
#include "fileio/scanf/fin_format_parser.h"

#include <array>

namespace cli {

using namespace Orvandeil::FileIO;

namespace {

struct PieceKind {
    const char* name;
    const char* words;
};

// By FORMAT.
constexpr std::array<PieceKind, 11> pieceKinds = {{
    {"literal", "text"},
    {"integer", "a whole number"},
    {"integerOrHex", "a whole number, hexadecimal behind 0x, octal behind 0,"},
    {"unsigned", "an unsigned number"},
    {"hex", "a hexadecimal number"},
    {"octal", "an octal number"},
    {"float", "a floating number"},
    {"string", "a word"},
    {"char", "text with its blanks"},
    {"scanset", "a run of characters"},
    {"error", "malformed"},
}};

const PieceKind& kindOf(const finFormatPiece& piece) {
    return pieceKinds[static_cast<std::size_t>(piece.getFormat())];
}

std::string rangeWords(const finFormatPiece& piece) {
    if (piece.getClassID() == vxCHAR_CLASS) return {};
    const std::u16string_view text = piece.getText();
    const char16_t lengthLetter = text[text.size() - 2];
    if (piece.getFormat() == FORMAT::Float) {
        return lengthLetter == u'h' ? " in single precision" : "";
    }
    return lengthLetter == u'h'   ? " of 16 bits"
           : lengthLetter == u'l' ? " of 64 bits"
                                  : " of 32 bits";
}

int mostCharacters(const finFormatPiece& piece) {
    const bool isOneByDefault = piece.getFormat() == FORMAT::Char && piece.getWidth() < 0;
    return isOneByDefault ? 1 : piece.getWidth();
}

std::string conversionWords(const finFormatPiece& piece) {
    std::string words = kindOf(piece).words + rangeWords(piece);
    const int most = mostCharacters(piece);
    if (most > 0) words += ", at most " + std::to_string(most);
    if (most > 0) words += most == 1 ? " character" : " characters";
    if (piece.isSuppressed()) words += ", not stored";
    return words;
}

void writePiece(JsonWriter& json, const finFormatPiece& piece) {
    json.startObject();
    json.key("kind").value(kindOf(piece).name);
    json.key("text").value(piece.getText());
    json.key("width").value(piece.getWidth());
    json.key("suppress").value(piece.isSuppressed());
    json.key("class").value(static_cast<int>(piece.getClassID()));
    json.endObject();
}

template <class Use>
void forEachPiece(finFormatParser& parser, Use use) {
    int status = 0;
    for (std::size_t i = 0; i < parser.getPieceCount(); ++i)
        use(*parser.fiPkGetScanFormatPiece(i, status));
}

void explainAsJson(finFormatParser& parser, Report& report) {
    report.key("resultClass", static_cast<int>(parser.getResultClass()));
    JsonWriter& json = report.object();
    json.key("pieces").startList();
    forEachPiece(parser, [&json](const finFormatPiece& piece) { writePiece(json, piece); });
    json.endList();
    if (parser.getError() != 0) report.note(parser.getError());
}

std::string malformedWords(const std::u16string& format) {
    const std::string place = malformedScanPlace(format);
    return "malformed: " + (place.empty() ? "the format is empty" : place);
}

void explainInWords(const std::u16string& format, finFormatParser& parser, Report& report) {
    std::u16string_view rest = format;
    forEachPiece(parser, [&](const finFormatPiece& piece) {
        // The text that a piece keeps is without its "*".
        const std::size_t length = piece.getText().size() + (piece.isSuppressed() ? 1 : 0);
        const std::u16string_view source = rest.substr(0, length);
        rest.remove_prefix(length);
        if (piece.getFormat() == FORMAT::Error) {
            report.print(malformedWords(format) + '\n');
        } else if (piece.isLiteral()) {
            report.print("matches " + quoted(source) + '\n');
        } else {
            report.print(escaped(source) + "  " + conversionWords(piece) + '\n');
        }
    });
    report.print(std::string("delivered: ") + embedded::nameOfClass(parser.getResultClass()) +
                 '\n');
}

}  // namespace

void explainScanFormat(const std::string& text, const CommandLine&, Report& report) {
    const std::u16string format = vxTextFromNarrow(text.data(), text.size());
    finFormatParser parser(format.c_str(), nullptr);
    parser.InitFormatPieces();
    if (report.isJson()) {
        explainAsJson(parser, report);
    } else {
        explainInWords(format, parser, report);
    }
}

}  // namespace cli
