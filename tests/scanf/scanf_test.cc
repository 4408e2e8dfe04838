#include "fileio/errors/code_list.h"
#include "fileio/scanf/fin_format_parser.h"
#include "fileio/scanf/fin_format_pieces.h"
#include "fileio/scanf/scan_control.h"
#include "fileio/text/input_string_stream.h"
#include "tests/support/printing.h"
#include "tests/support/scanning.h"
#include "tests/support/test_files.h"

#include <cerrno>
#include <numeric>
#include <string>

#include <gtest/gtest.h>

namespace {

using namespace Orvandeil::FileIO;
using fileio_tests::toUtf8;
using support::scanText;
using support::unlimited;

const char* const names[] = {"literal", "integer", "integerOrHex", "unsigned", "hex",  "octal",
                             "float",   "string",  "char",         "scanset",  "error"};

struct Parsed {
    explicit Parsed(const std::u16string& format, TcodnStream* input = nullptr)
        : parser(format.c_str(), input) {
        parser.InitFormatPieces();
    }
    finFormatPiece& piece(std::size_t index) {
        int status = 1;
        finFormatPiece* found = parser.fiPkGetScanFormatPiece(index, status);
        EXPECT_EQ(status, 0);
        return *found;
    }
    finFormatParser parser;
};

// "integer(%5d)5": kind, text, width; a "*" for a suppressed conversion.
std::string describe(const finFormatPiece& piece) {
    return names[static_cast<int>(piece.getFormat())] + ('(' + toUtf8(piece.getText())) + ')' +
           (piece.isSuppressed() ? "*" : "") +
           (piece.getWidth() > 0 ? std::to_string(piece.getWidth()) : "");
}

// Every letter with every length letter: what it reads, and into which class.
TEST(FinFormatParser, Conversions) {
    const std::u16string letters = u"diuxXoefgEGsc", prefixes = u"hl%*-[0123456789";
    const FORMAT formats[] = {
        FORMAT::Integer, FORMAT::IntegerOrHex, FORMAT::Unsigned, FORMAT::Hex,   FORMAT::Hex,
        FORMAT::Octal,   FORMAT::Float,        FORMAT::Float,    FORMAT::Float, FORMAT::Float,
        FORMAT::Float,   FORMAT::String,       FORMAT::Char};
    for (const std::u16string length : {u"", u"h", u"l"}) {
        for (char16_t letter = 1; letter < 0x180; ++letter) {
            if (prefixes.find(letter) != prefixes.npos) continue;
            const std::size_t at = letters.find(letter);
            const bool isNumber = at < 11;
            const bool isKnown = isNumber || (at != letters.npos && length.empty());
            const int wide = at < 2 ? vxINT64_CLASS : at < 6 ? vxUINT64_CLASS : vxDOUBLE_CLASS;
            Parsed parsed(u"%" + length + letter);
            const finFormatPiece& piece = parsed.piece(0);
            SCOPED_TRACE(toUtf8(piece.getText()));
            EXPECT_EQ(piece.getFormat(), isKnown ? formats[at] : FORMAT::Error);
            EXPECT_EQ(piece.getClassID(), !isNumber        ? vxCHAR_CLASS
                                          : length == u"l" ? wide
                                                           : vxDOUBLE_CLASS);
            EXPECT_EQ(parsed.parser.getError(), isKnown ? 0 : code::InvalidFormat);
        }
    }
}

// The texts of the pieces make up the format, but for the asterisks; only the last is an error.
// Every format can be run.
void checkFormat(const std::u16string& format) {
    const std::string input = "12 %a 0x1f]-%";
    inputStringStream stream(input.c_str(), std::ssize(input), "");
    Parsed parsed(format, &stream);
    std::size_t units = 0;
    const std::size_t count = parsed.parser.getPieceCount();
    for (std::size_t i = 0; i < count; ++i) {
        const finFormatPiece& piece = parsed.piece(i);
        units += piece.getText().size() + (piece.isSuppressed() ? 1 : 0);
        const bool isError = piece.getFormat() == FORMAT::Error;
        ASSERT_EQ(isError, parsed.parser.getError() != 0 && i + 1 == count);
    }
    ASSERT_EQ(units, format.size()) << toUtf8(format);
    const int code = support::scan(stream, toUtf8(format), support::unlimited).code;
    ASSERT_TRUE(code == 0 || code == -9 || code == -8) << toUtf8(format) << " gives " << code;
}

// Every format that goes on behind `format` with up to `more` characters of the alphabet.
void checkFormats(const std::u16string& alphabet, const std::u16string& format, int more) {
    if (!format.empty()) checkFormat(format);
    for (std::size_t i = 0; more > 0 && i < alphabet.size(); ++i)
        checkFormats(alphabet, format + alphabet[i], more - 1);
}

TEST(FinFormatParser, EveryShortFormat) {
    std::u16string ascii(127, u'\0');
    std::iota(ascii.begin(), ascii.end(), u'\1');
    checkFormats(ascii, u"%", 2);
    checkFormats(u"%*d5[]^-l", u"", 5);
}

TEST(FinFormatParser, HandsPiecesOutOverAndOver) {
    Parsed parsed(u"%d,%d");
    int status = 7;
    for (std::size_t i = 0; i < 3; ++i) {
        EXPECT_EQ(parsed.parser.fiPkGetNextScanFormatPiece(status), &parsed.piece(i));
        EXPECT_EQ(status, 0);
    }
    EXPECT_EQ(parsed.parser.getNextIndex(), 3u);
    EXPECT_FALSE(parsed.parser.isRecycled());
    EXPECT_EQ(parsed.parser.fiPkGetNextScanFormatPiece(status), &parsed.piece(0));
    EXPECT_TRUE(parsed.parser.isRecycled());
    EXPECT_EQ(parsed.parser.fiPkGetScanFormatPiece(3, status), nullptr);
    EXPECT_EQ(status, 45);
}

TEST(FinFormatParser, ClonesOutliveTheirParser) {
    inputStringStream stream("cab12", 5, "");
    auto parsed = std::make_unique<Parsed>(u"%2[c-a]b%*5d%q", &stream);
    std::vector<std::unique_ptr<finFormatPiece>> clones;
    std::vector<std::string> originals;
    for (std::size_t i = 0; i < parsed->parser.getPieceCount(); ++i) {
        if (i != 1) parsed->piece(i).getAsciiText();
        clones.push_back(parsed->piece(i).clone());
        originals.push_back(describe(parsed->piece(i)));
    }
    parsed.reset();
    OutputBuffer result(vxCHAR_CLASS, 4, 4, 4);
    for (std::size_t i = 0; i < clones.size(); ++i) {
        int status = 0;
        bool failed = false;
        clones[i]->scan(stream, result, false, failed, status);
        EXPECT_EQ(status, i < 3 ? 0 : code::InvalidFormat);
        EXPECT_EQ(failed, i == 3);
        EXPECT_EQ(clones[i]->isLiteral(), i == 1);
        EXPECT_EQ(describe(*clones[i]), originals[i]);
        EXPECT_EQ(clones[i]->getAsciiText(), toUtf8(clones[i]->getText()));
    }
    EXPECT_EQ(result.GetSize(), 2u);
    EXPECT_TRUE(stream.EndOfData());
    EXPECT_EQ(Parsed(u"ä").piece(0).getAsciiText(), nullptr);
}

// A scan goes on where the one before it stopped, whatever it stopped at.
TEST(ScanControl, ContinuesWhereTheLastScanStopped) {
    const std::string text = "12 ab-€7";
    inputStringStream stream(text.c_str(), std::ssize(text), "UTF-8");
    const auto scan = [&](const char* format) {
        return support::scan(stream, format, unlimited).summary();
    };
    EXPECT_EQ(scan("%d"), "12 #1 =-9 @3");
    EXPECT_EQ(scan("abc"), "'' #0 =-9 @5");
    EXPECT_EQ(scan("-a"), "'' #0 =-9 @6");
    EXPECT_EQ(scan("%[0-9]"), "'' #0 =-9 @6");
    EXPECT_EQ(scan("%s"), "'€7' #1 =0 @10");
}

TEST(ScanControl, ReportsTheErrorOfTheFile) {
    for (const char* format : {"%d", "%f", "%s", "%c", "%x"}) {
        support::OpenedFile folder(".");
        EXPECT_EQ(support::scan(folder.stream, format, unlimited).code, EISDIR) << format;
    }
}

TEST(ScanControl, TellsWhetherTheFormatCameRound) {
    EXPECT_TRUE(scanText("1 2", "%d", unlimited).result);
    EXPECT_FALSE(scanText("1", "%d%d", unlimited).result);
    EXPECT_TRUE(scanText("1 2", "%d%d", 1).result);
    EXPECT_FALSE(scanText("1 x", "%d%d", 2).result);
    EXPECT_TRUE(scanText("1 2 x", "%d%d", 3).result);
}

struct WatchingControl : scanControl {
    using scanControl::scanControl;
    bool pieceFlag(OutputBuffer& result) override {
        ++asked;
        lastBuffer = &result;
        return true;
    }
    unsigned long asked = 0;
    OutputBuffer* lastBuffer = nullptr;
};

TEST(ScanControl, AsksForTheFlagOnceAPiece) {
    inputStringStream stream("1,2,3", 5, "");
    finFormatParser parser(u"%d,", &stream);
    OutputBuffer buffer(vxDOUBLE_CLASS, 4, 4, 4);
    unsigned long count = 0;
    parser.InitFormatPieces();
    WatchingControl control(2, false, count, stream, parser, buffer);
    EXPECT_TRUE(control.performMainScan());
    EXPECT_EQ(control.asked, 4u);
    EXPECT_EQ(control.lastBuffer, &buffer);
    EXPECT_EQ(control.getConversions(), 4u);

    finFormatParser unready(u"%d", &stream);
    scanControl early(0, true, count, stream, unready, buffer);
    EXPECT_FALSE(early.performMainScan()) << "there are no pieces yet";
    EXPECT_EQ(early.getError(), 45);
}

}  // namespace
