#include "fileio/scanf/fin_format_parser.h"

#include "fileio/errors/code_list.h"
#include "fileio/scanf/fin_format_pieces.h"
#include "fileio/text/input_string_stream.h"
#include "tests/support/printing.h"
#include "tests/support/scanning.h"

#include <memory>
#include <string>
#include <vector>

#include <gtest/gtest.h>

namespace {

using namespace Orvandeil::FileIO;

const char* const names[] = {"literal", "integer", "integerOrHex", "unsigned", "hex",  "octal",
                             "float",   "string",  "char",         "scanset",  "error"};

// "integer(%5d) 5 6": kind, text, width, class; a "*" for a suppressed conversion.
std::string describe(const finFormatPiece& piece) {
    return std::string(names[static_cast<int>(piece.getFormat())]) + '(' +
           fileio_tests::toUtf8(piece.getText()) + ')' + (piece.isSuppressed() ? "*" : "") + ' ' +
           std::to_string(piece.getWidth()) + ' ' + std::to_string(piece.getClassID());
}

std::string describe(finFormatParser& parser) {
    std::string all;
    for (std::size_t i = 0; i < parser.getPieceCount(); ++i) {
        int status = 1;
        const finFormatPiece* piece = parser.fiPkGetScanFormatPiece(i, status);
        EXPECT_EQ(status, 0);
        all += (i == 0 ? "" : ", ") + describe(*piece);
    }
    return all;
}

struct Row {
    int line;
    const char* format;
    const char* pieces;
    int resultClass;
    int error;
};

const Row rows[] = {
    {__LINE__, "", "error() -1 4", 4, -8},
    {__LINE__, "abc", "literal(abc) 0 4", 4, 0},
    {__LINE__, "%d,%d", "integer(%d) -1 6, literal(,) 0 4, integer(%d) -1 6", 6, 0},
    {__LINE__, "%*d", "integer(%d)* -1 6", 6, 0},
    {__LINE__, "%*3ld", "integer(%3ld)* 3 14", 14, 0},
    {__LINE__, "%99999999999d", "integer(%99999999999d) 2147483647 6", 6, 0},
    {__LINE__, "%5.2f", "error(%5.2f) -1 4", 4, -8},
    {__LINE__, "a%d%q", "literal(a) 0 4, integer(%d) -1 6, error(%q) -1 4", 6, -8},

    // The order decides the class.
    {__LINE__, "%s%ld", "string(%s) -1 4, integer(%ld) -1 14", 14, 0},
    {__LINE__, "%ld%s", "integer(%ld) -1 14, string(%s) -1 4", 6, 0},
    {__LINE__, "%ld%lu", "integer(%ld) -1 14, unsigned(%lu) -1 15", 6, 0},
    {__LINE__, "%ld%li", "integer(%ld) -1 14, integerOrHex(%li) -1 14", 14, 0},
    {__LINE__, "%lo,%lx", "octal(%lo) -1 15, literal(,) 0 4, hex(%lx) -1 15", 15, 0},
    {__LINE__, "%*d%ld", "integer(%d)* -1 6, integer(%ld) -1 14", 6, 0},
    {__LINE__, "%c%[a]", "char(%c) -1 4, scanset(%[a]) -1 4", 4, 0},

    // Sets.
    {__LINE__, "%[]a]", "scanset(%[]a]) -1 4", 4, 0},
    {__LINE__, "%[^]a]b", "scanset(%[^]a]) -1 4, literal(b) 0 4", 4, 0},
    {__LINE__, "%*3[^a]", "scanset(%3[^a])* 3 4", 4, 0},
    {__LINE__, "%[a^]]", "scanset(%[a^]) -1 4, literal(]) 0 4", 4, 0},
    {__LINE__, "%[%]", "scanset(%[%]) -1 4", 4, 0},
    {__LINE__, "%[]", "error(%[]) -1 4", 4, -8},
    {__LINE__, "%[^]", "error(%[^]) -1 4", 4, -8},
    {__LINE__, "%[^", "error(%[^) -1 4", 4, -8},

    // Percent signs.
    {__LINE__, "a%%b", "literal(a%%b) 0 4", 4, 0},
    {__LINE__, "a%%%d", "literal(a%%) 0 4, integer(%d) -1 6", 6, 0},
    {__LINE__, "%%", "literal(%%) 0 4", 4, 0},
    {__LINE__, "%%a", "literal(%%) 0 4, literal(a) 0 4", 4, 0},
    {__LINE__, "%%%d", "literal(%%) 0 4, integer(%d) -1 6", 6, 0},
    {__LINE__, "%%a%d", "literal(%%a%d) 0 4", 4, 0},
    {__LINE__, "%d%% %d", "integer(%d) -1 6, literal(%% %d) 0 4", 6, 0},
    {__LINE__, "%%, %d", "literal(%%) 0 4, literal(, ) 0 4, integer(%d) -1 6", 6, 0},
    {__LINE__, "%%a%%d", "integer(%%a%%d) -1 6", 6, 0},
    {__LINE__, "%%a%%*2[x]", "scanset(%%a%%2[x])* 2 4", 4, 0},
    {__LINE__, "%%a%", "error(%%a%) -1 4", 4, -8},
    {__LINE__, "%%%", "literal(%%) 0 4, error(%) -1 4", 4, -8},
    {__LINE__, "%%%%", "error(%%%%) -1 4", 4, -8},
};

TEST(FinFormatParser, Pieces) {
    for (const Row& row : rows) {
        SCOPED_TRACE(row.line);
        const std::u16string format = fileio_tests::toUtf16(row.format);
        finFormatParser parser(format.c_str(), nullptr);
        parser.InitFormatPieces();
        EXPECT_EQ(describe(parser), row.pieces);
        EXPECT_EQ(parser.getResultClass(), row.resultClass);
        EXPECT_EQ(parser.getError(), row.error);
    }
}

// Every letter with every length letter: what it reads, and into which class.
TEST(FinFormatParser, Conversions) {
    struct {
        const char16_t* letters;
        FORMAT format;
        int classes[3];  // without a length letter, with h, with l; 0: not allowed
    } const conversions[] = {
        {u"d", FORMAT::Integer, {6, 6, 14}},  {u"i", FORMAT::IntegerOrHex, {6, 6, 14}},
        {u"u", FORMAT::Unsigned, {6, 6, 15}}, {u"xX", FORMAT::Hex, {6, 6, 15}},
        {u"o", FORMAT::Octal, {6, 6, 15}},    {u"efgEG", FORMAT::Float, {6, 6, 6}},
        {u"s", FORMAT::String, {4, 0, 0}},    {u"c", FORMAT::Char, {4, 0, 0}},
    };
    const std::u16string lengths[] = {u"", u"h", u"l"};
    for (char16_t letter = 1; letter < 0x180; ++letter) {
        if (std::u16string_view(u"hl%*-[0123456789").find(letter) != std::u16string_view::npos)
            continue;
        for (std::size_t length = 0; length < 3; ++length) {
            FORMAT wanted = FORMAT::Error;
            int wantedClass = 4;
            for (const auto& row : conversions) {
                const std::u16string_view letters = row.letters;
                if (letters.find(letter) == letters.npos || row.classes[length] == 0) continue;
                wanted = row.format;
                wantedClass = row.classes[length];
            }
            const std::u16string format = u"%" + lengths[length] + letter;
            finFormatParser parser(format.c_str(), nullptr);
            parser.InitFormatPieces();
            int status = 0;
            const finFormatPiece* piece = parser.fiPkGetScanFormatPiece(0, status);
            EXPECT_EQ(piece->getFormat(), wanted) << fileio_tests::toUtf8(format);
            EXPECT_EQ(piece->getClassID(), wantedClass) << fileio_tests::toUtf8(format);
            EXPECT_EQ(parser.getError(), wanted == FORMAT::Error ? code::InvalidFormat : 0);
        }
    }
}

// The texts of the pieces make up the format, but for the asterisks; only the last is an error.
// Every format can be run.
void checkFormat(const std::u16string& format) {
    const std::string input = "12 %a 0x1f]-%";
    inputStringStream stream(input.c_str(), static_cast<long>(input.size()), "");
    finFormatParser parser(format.c_str(), &stream);
    parser.InitFormatPieces();
    std::size_t units = 0;
    const std::size_t count = parser.getPieceCount();
    for (std::size_t i = 0; i < count; ++i) {
        int status = 0;
        const finFormatPiece* piece = parser.fiPkGetScanFormatPiece(i, status);
        units += piece->getText().size() + (piece->isSuppressed() ? 1 : 0);
        const bool isError = piece->getFormat() == FORMAT::Error;
        ASSERT_EQ(isError, parser.getError() != 0 && i + 1 == count);
    }
    ASSERT_EQ(units, format.size()) << fileio_tests::toUtf8(format);
    const support::Scanned scanned =
        support::scan(stream, fileio_tests::toUtf8(format), support::unlimited);
    ASSERT_TRUE(scanned.code == 0 || scanned.code == -9 || scanned.code == -8)
        << fileio_tests::toUtf8(format) << " gives " << scanned.code;
}

TEST(FinFormatParser, EveryShortFormat) {
    for (char16_t first = 1; first < 128; ++first) {
        checkFormat(std::u16string(u"%") + first);
        for (char16_t second = 1; second < 128; ++second)
            checkFormat(std::u16string(u"%") + first + second);
    }
    const std::u16string special = u"%*d5[]^-l";
    std::size_t total = 1;
    for (std::size_t length = 1; length <= 5; ++length) {
        total *= special.size();
        for (std::size_t number = 0; number < total; ++number) {
            std::u16string format;
            for (std::size_t rest = number; format.size() < length; rest /= special.size())
                format += special[rest % special.size()];
            checkFormat(format);
        }
    }
}

TEST(FinFormatParser, HandsPiecesOutOverAndOver) {
    finFormatParser parser(u"%d,%d", nullptr);
    parser.InitFormatPieces();
    int status = 7;
    finFormatPiece* const first = parser.fiPkGetNextScanFormatPiece(status);
    EXPECT_EQ(status, 0);
    parser.fiPkGetNextScanFormatPiece(status);
    parser.fiPkGetNextScanFormatPiece(status);
    EXPECT_EQ(parser.getNextIndex(), parser.getPieceCount());
    EXPECT_FALSE(parser.isRecycled());
    EXPECT_EQ(parser.fiPkGetNextScanFormatPiece(status), first);
    EXPECT_TRUE(parser.isRecycled());
    EXPECT_EQ(parser.fiPkGetScanFormatPiece(3, status), nullptr);
    EXPECT_EQ(status, 45);
}

TEST(FinFormatParser, ClonesOutliveTheirOriginals) {
    inputStringStream stream("5cab", 4, "");
    OutputBuffer result(vxDOUBLE_CLASS, 4, 4, 4);
    std::vector<std::unique_ptr<finFormatPiece>> clones;
    std::string originals;
    {
        finFormatParser parser(u"%hd%2[c-a]bä%*s%3c%q", &stream);
        parser.InitFormatPieces();
        originals = describe(parser);
        for (std::size_t i = 0; i < parser.getPieceCount(); ++i) {
            int status = 0;
            finFormatPiece* piece = parser.fiPkGetScanFormatPiece(i, status);
            const bool isAscii = i != 2;
            EXPECT_EQ(piece->getAsciiText() != nullptr, isAscii);
            clones.push_back(piece->clone());
            EXPECT_NE(clones.back()->getText().data(), piece->getText().data());
            EXPECT_EQ(clones.back()->getAsciiText() != nullptr, isAscii);
        }
    }
    const int statuses[] = {0, 0, 0, 0, 0, code::InvalidFormat};
    std::string copies;
    for (std::size_t i = 0; i < clones.size(); ++i) {
        int status = 0;
        bool failed = false;
        clones[i]->scan(stream, result, false, failed, status);
        EXPECT_EQ(status, statuses[i]);
        EXPECT_EQ(failed, i >= 2);
        copies += (i == 0 ? "" : ", ") + describe(*clones[i]);
    }
    EXPECT_EQ(copies, originals);
    EXPECT_EQ(result.GetSize(), 3u);
    EXPECT_TRUE(stream.EndOfData());
}

}  // namespace
