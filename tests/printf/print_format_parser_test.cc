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

// "'literal'" or the printf text, each with its position and flags.
std::string describe(PrintFormatParser& parser) {
    std::string text;
    try {
        while (const foutFormatPiece* piece = parser.getNextPrintFormatPiece()) {
            const bool isLiteral = piece->getConversion() == NoConversion;
            text +=
                isLiteral ? '\'' + toUtf8(literalTextOf(*piece)) + '\'' : piece->getPrintfText();
            text += '@' + std::to_string(piece->getFormatPosition());
            if (piece->getFlags() != NoFlags) text += 'f' + std::to_string(piece->getFlags());
            text += ' ';
        }
    } catch (int failure) {
        text += '!' + std::to_string(failure);
    }
    return text;
}

// A forced sign takes the width away, and with it the reference that a width may be.
TEST(PrintFormatParser, PlacesPiecesAndForcesSigns) {
    const struct {
        const char* format;
        bool forceSign;
        const char* pieces;
    } rows[] = {{"a%db", false, "'a'@1 %lld@1 'b'@3 "},
                {"100%%", false, "'100'@3 '%'@3 "},
                {"%%%", false, "'%'@0 !-8"},
                {"%-+08.3lx=%y", false, "%-+08.3llx@0f19 '='@10 !-8"},
                {"%1$d %d", false, "%lld@0 ' '@5 !-8"},
                {"%5d%*d%+d", true, "%+lld@0f2 %+lld@3f2 %+lld@6f2 "},
                {"%*1$d", true, "%+lld@0f2 "}};
    for (const auto& row : rows) {
        PrintFormatParser parser(toUtf16(row.format), row.forceSign);
        EXPECT_EQ(describe(parser), row.pieces) << row.format;
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
