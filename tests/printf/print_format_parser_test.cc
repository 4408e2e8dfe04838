#include "fileio/printf/print_format_parser.h"

#include "fileio/errors/code_list.h"
#include "fileio/printf/fout_format_pieces.h"
#include "fileio/text/output_string_stream.h"
#include "tests/support/printing.h"

#include <stdexcept>

#include <gtest/gtest.h>

using namespace Orvandeil::FileIO;
using fileio_tests::toUtf16;
using fileio_tests::toUtf8;

namespace {

std::string describeField(char name, WidthPrecisionFieldType kind, int value) {
    if (kind == FieldAbsent) return {};
    return std::string(" ") + name + std::to_string(kind) + ':' + std::to_string(value);
}

// "'literal'" or "printf text class/modifier f<flags> n<numbered> w<kind>:<value> p<kind>:<value>",
// each piece with its position.
std::string describe(const foutFormatPiece& piece) {
    const std::string place = '@' + std::to_string(piece.getFormatPosition());
    if (piece.getConversion() == NoConversion) {
        return '\'' + toUtf8(literalTextOf(piece)) + '\'' + place;
    }
    std::string text = piece.getPrintfText() + ' ' + std::to_string(piece.getConversion());
    if (piece.getSubformat() != NoSubformat) text += '/' + std::to_string(piece.getSubformat());
    if (piece.getFlags() != NoFlags) text += " f" + std::to_string(piece.getFlags());
    if (piece.getNumberedIndex() != 0) text += " n" + std::to_string(piece.getNumberedIndex());
    return text + describeField('w', piece.getWidthKind(), piece.getWidthValue()) +
           describeField('p', piece.getPrecisionKind(), piece.getPrecisionValue()) + place;
}

std::string describe(PrintFormatParser& parser) {
    std::string text;
    try {
        while (const foutFormatPiece* piece = parser.getNextPrintFormatPiece()) {
            text += describe(*piece) + "; ";
        }
    } catch (int failure) {
        text += '!' + std::to_string(failure);
    }
    return text;
}

struct ParserRow {
    int line;
    const char* format;
    bool forceSign;
    const char* pieces;
    int argumentType;
    unsigned long conversions;
};

const ParserRow parserRows[] = {
    {__LINE__, "a%db", false, "'a'@1; %lld 1@1; 'b'@3; ", 1, 1},
    {__LINE__, "100%%", false, "'100'@3; '%'@3; ", 0, 0},
    {__LINE__, "%%%", false, "'%'@0; !-8", 0, 0},
    {__LINE__, "x=%y", false, "'x='@2; !-8", 0, 0},
    {__LINE__, "%-+08.3lx", false, "%-+08.3llx 5/2 f19 w0:8 p0:3@0; ", 1, 1},
    {__LINE__, "%1$d %d", false, "%lld 1 n1@0; ' '@5; !-8", 2, 2},
    {__LINE__, "%hd%ld%i", false, "%lld 1/1@0; %lld 1/2@3; %lli 2@6; ", 1, 3},
    {__LINE__, "%5d%*d%+d", true, "%+lld 1 f2@0; %+lld 1 f2@3; %+lld 1 f2@6; ", 1, 3},
    {__LINE__, "%*1$d", true, "%+lld 1 f2@0; ", 1, 1},  // a dropped width is no reference
};

TEST(PrintFormatParser, SplitsFormatsIntoPieces) {
    for (const ParserRow& row : parserRows) {
        PrintFormatParser parser(toUtf16(row.format), row.forceSign);
        EXPECT_EQ(describe(parser), row.pieces) << "row of line " << row.line;
        EXPECT_EQ(parser.getArgumentType(), row.argumentType) << "row of line " << row.line;
        EXPECT_EQ(parser.getConversionCount(), row.conversions) << "row of line " << row.line;
    }
}

TEST(PrintFormatParser, KeepsNulInsideTheFormat) {
    using namespace std::string_view_literals;
    PrintFormatParser parser(std::u16string(u"a\0b%d\0"sv), false);
    EXPECT_EQ(literalTextOf(*parser.getNextPrintFormatPiece()), u"a\0b"sv);
    EXPECT_EQ(parser.getNextPrintFormatPiece()->getConversion(), ConvD);
    EXPECT_EQ(literalTextOf(*parser.getNextPrintFormatPiece()), u"\0"sv);
    EXPECT_EQ(parser.getNextPrintFormatPiece(), nullptr);
}

TEST(PrintFormatParser, StartsOverUnlessNumbered) {
    PrintFormatParser sequential(u"%d%s", false);
    PrintFormatParser numbered(u"%1$d", false);
    EXPECT_TRUE(sequential.getHasStringConversion());
    EXPECT_FALSE(numbered.getHasStringConversion());
    for (PrintFormatParser* parser : {&sequential, &numbered}) {
        foutFormatPiece* const first = parser->getNextPrintFormatPiece();
        while (parser->getNextPrintFormatPiece() != nullptr) {
        }
        parser->resetParser();
        EXPECT_EQ(parser->getNextPrintFormatPiece(), parser == &sequential ? first : nullptr);
    }
}

TEST(PrintFormatParser, TellsTrailingBlanksFromText) {
    const struct {
        int line;
        const char* format;
        bool justification;
    } rows[] = {
        {__LINE__, "%-5d  ", true},        {__LINE__, "%-5d", true},
        {__LINE__, "%-5d x", false},       {__LINE__, "%5d ", false},
        {__LINE__, "%-5d%% \n", true},     {__LINE__, "%-5d %d ", false},
        {__LINE__, "%-5d\xC2\xA0", false},  // a no-break blank
    };
    for (const auto& row : rows) {
        EXPECT_EQ(
            PrintFormatParser(toUtf16(row.format), false).trailingWhitespaceIsLeftJustification(),
            row.justification)
            << "row of line " << row.line;
    }
}

TEST(PrintFormatParser, PrintsTheRestAsItStands) {
    PrintFormatParser parser(u"ab%d%%z", false);
    outputStringStream out("UTF-8");
    EXPECT_THROW(parser.printRemainingFormatAsLiteral(&out), std::out_of_range);
    std::string expected;
    for (const char* rest : {"%d%%z", "%d%%z", "%%z", "z"}) {
        parser.getNextPrintFormatPiece();
        parser.printRemainingFormatAsLiteral(&out);
        expected += rest;
    }
    EXPECT_EQ(fileio_tests::taken(out), expected);
}

}  // namespace
