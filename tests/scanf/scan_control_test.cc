#include "fileio/scanf/scan_control.h"

#include "embedded/services/memory.h"
#include "fileio/text/input_string_stream.h"
#include "tests/support/scanning.h"
#include "tests/support/test_files.h"

#include <cerrno>

#include <gtest/gtest.h>

namespace {

using namespace Orvandeil::FileIO;
using namespace std::string_literals;
using support::scanFile;
using support::scanPipe;
using support::scanText;
using support::unlimited;

struct Row {
    int line;
    const char* format;
    std::string input;
    long limit;
    std::string expected;
};

// A pipe gives what a file gives, but knows no position.
void expectFromFile(const Row& row) {
    SCOPED_TRACE(row.line);
    EXPECT_EQ(scanFile(row.input, row.format, row.limit).summary(), row.expected);
    EXPECT_EQ(scanPipe(row.input, row.format, row.limit).summary(),
              row.expected.substr(0, row.expected.rfind(" @")));
}

void expectFromText(const Row& row, const std::string& expected) {
    SCOPED_TRACE(row.line);
    EXPECT_EQ(scanText(row.input, row.format, row.limit).summary(), expected);
}

const Row sameRows[] = {
    {__LINE__, "%d", "1 2 3", unlimited, "1 2 3 #3 =0 @5"},
    {__LINE__, "%d", "1 2 3\n", unlimited, "1 2 3 #3 =0 @6"},
    {__LINE__, "%d", "1 2 3", 2, "1 2 #2 =0 @3"},
    {__LINE__, "%d,", "1,2,3", unlimited, "1 2 3 #3 =0 @5"},
    {__LINE__, "%d,", "1;2", unlimited, "1 #1 =-9 @1"},

    // Text behind the last value.
    {__LINE__, "%d abc", "5 abc", 1, "5 #1 =0 @5"},
    {__LINE__, "%d,", "1;2", 1, "1 #1 =-9 @1"},
    {__LINE__, "%d,%d", "1,2,3", 1, "1 #1 =0 @2"},
    {__LINE__, "%d;%d,", "1;2,3;4,", 2, "1 2 #2 =0 @4"},
    {__LINE__, "abc%d", "abc5", 0, "#0 =0 @3"},

    // Formats that store nothing.
    {__LINE__, "abc", "abcabc", unlimited, "'' #0 =0 @3"},
    {__LINE__, "abc", "abx", unlimited, "'' #0 =-9 @2"},
    {__LINE__, "%*d", "1 2 3", 2, "#0 =0 @3"},
    {__LINE__, "%*d%*d", "1 2 3 4 5", 3, "#0 =0 @5"},
    {__LINE__, "%*d%*d", "1 2 3 4 5", 1, "#0 =0 @9"},
    {__LINE__, "%*d %*[a-z]", "1 ab 2 cd", unlimited, "#0 =0 @9"},

    // Percent signs.
    {__LINE__, "%%%d", "%5", 1, "5 #1 =0 @2"},
    {__LINE__, "%%%d", "x5", 1, "#0 =-9 @0"},
    {__LINE__, "%d%%", "5%6%", unlimited, "5 6 #2 =0 @4"},
    {__LINE__, "%d%%x", "5%x", 1, "5 #1 =0 @3"},
    {__LINE__, "%%a%d", "%a%", unlimited, "'' #0 =0 @3"},
    {__LINE__, "%%a%", "%a%", unlimited, "'' #0 =-8 @0"},
    {__LINE__, "%d %q", "1 2", unlimited, "1 #1 =-8 @2"},
    {__LINE__, "%d %q", "1 2", 1, "1 #1 =0 @2"},
    {__LINE__, "", "1", unlimited, "'' #0 =-8 @0"},

    // Integers.
    {__LINE__, "%hd", "32767 32768 -32769 99999999999999999999", unlimited,
     "32767 32767 -32768 32767 #4 =0 @39"},
    {__LINE__, "%d", "2147483648 -2147483649", unlimited, "2147483647 -2147483648 #2 =0 @22"},
    {__LINE__, "%ld", "9223372036854775808 -9223372036854775809 9007199254740993", unlimited,
     "9223372036854775807 -9223372036854775808 9007199254740993 #3 =0 @57"},
    {__LINE__, "%hu", "-1 -65535 -65536 -70000 65536 -0", unlimited,
     "65535 1 0 0 65535 0 #6 =0 @32"},
    {__LINE__, "%u", "4294967296 -1 -4294967296", unlimited, "4294967295 4294967295 0 #3 =0 @25"},
    {__LINE__, "%lu", "-1 18446744073709551616", unlimited,
     "18446744073709551615 18446744073709551615 #2 =0 @23"},
    {__LINE__, "%x", "1f 0X1F -0x1 ffffffffff", unlimited, "31 31 4294967295 4294967295 #4 =0 @23"},
    {__LINE__, "%o", "17 -1 8", 2, "15 4294967295 #2 =0 @5"},
    {__LINE__, "%i", "0x1F 010 10 08", unlimited, "31 8 10 0 8 #5 =0 @14"},
    {__LINE__, "%2d%3d", "123456", unlimited, "12 345 6 #3 =0 @6"},
    {__LINE__, "%2147483647d", "12 3", unlimited, "12 3 #2 =0 @4"},
    {__LINE__, "%d", "+5 -5\t\v\f\r\n+0", unlimited, "5 -5 0 #3 =0 @12"},

    // Floating numbers.
    {__LINE__, "%f", "1 -2.5e3 .5 Inf -inf 1e999 1e-999", unlimited,
     "1 -2500 0.5 inf -inf inf 0 #7 =0 @33"},
    {__LINE__, "%hf", "0.1 1e300", unlimited, "0.10000000149011612 inf #2 =0 @9"},
    {__LINE__, "%3f", "1.2345", unlimited, "1.2 345 #2 =0 @6"},

    // A number out of range leaves no error behind for the end of the data.
    {__LINE__, "%d%s", "99999999999999999999", unlimited, "2147483647 #1 =0 @20"},
    {__LINE__, "%f%c", "1e999", unlimited, "inf #1 =0 @5"},

    // Words and characters.
    {__LINE__, "%s", "  ab\tcd ", unlimited, "'abcd' #2 =0 @8"},
    {__LINE__, "%*s%d", "ab 5", unlimited, "5 #1 =0 @4"},
    {__LINE__, "%c", " a", unlimited, "' a' #2 =0 @2"},
    {__LINE__, " %c", " a b ", unlimited, "'ab' #2 =0 @5"},
    {__LINE__, "%*2c%c", "abcdef", unlimited, "'cf' #2 =0 @6"},
    {__LINE__, "%2147483647c", "ab", unlimited, "'ab' #1 =0 @2"},
    {__LINE__, "%d%c", "5a", unlimited, "5 97 #2 =0 @2"},
    {__LINE__, "%s%ld", "ab 5", unlimited, "97 98 5 #2 =0 @4"},
    {__LINE__, "%ld%s", "5 ab", unlimited, "5 97 98 #2 =0 @4"},

    // Sets.
    {__LINE__, "%[0-9]", "123abc", 1, "'123' #1 =0 @3"},
    {__LINE__, "%[0-9]", "123abc", unlimited, "'123' #1 =-9 @3"},
    {__LINE__, "%[^,]", "ab,c", 1, "'ab' #1 =0 @2"},
    {__LINE__, "%[]-]", "]-]a", 1, "']-]' #1 =0 @3"},
    {__LINE__, "%[-a]", "-a-b", 1, "'-a-' #1 =0 @3"},
    {__LINE__, "%[a^]", "a^b", 1, "'a^' #1 =0 @2"},
    {__LINE__, "%[a-c-e]", "abc-ed", 1, "'abc-e' #1 =0 @5"},
    {__LINE__, "%[]-a]", "]^_`ab", 1, "']^_`a' #1 =0 @5"},
    {__LINE__, "%[--a]", "-09Aab", 1, "'-09Aa' #1 =0 @5"},
    {__LINE__, "%2[ab]", "ababa", unlimited, "'ababa' #3 =0 @5"},

    // Characters beyond ASCII; those beyond the Basic Multilingual Plane are U+001A.
    {__LINE__, "%s", "äö €", unlimited, "'äö€' #2 =0 @8"},
    {__LINE__, "%[^€]", "a€b", 1, "'a' #1 =0 @1"},
    {__LINE__, "%[ä-€]%c", "äö€x", unlimited, "'äö€x' #2 =0 @8"},
    {__LINE__, "%[\U0001F600-\U0001F602x]", "x\U0001F601", 1, "'x' #1 =0 @1"},
    {__LINE__, "%s", "\U0001F600a", unlimited,
     "'\x1A"
     "a' #1 =0 @5"},
    {__LINE__, "\U0001F600", "\U0001F600", unlimited, "'' #0 =-9 @0"},
    {__LINE__, "%c", "a\0b"s, unlimited, "'a\0b' #3 =0 @3"s},
};

TEST(ScanControl, FilesPipesAndTextsAgree) {
    for (const Row& row : sameRows) {
        expectFromFile(row);
        expectFromText(row, row.expected);
    }
}

TEST(ScanControl, FilesAndTextsDiffer) {
    const struct {
        Row row;  // as a file
        const char* fromText;
    } rows[] = {
        {{__LINE__, "%d", "1 2 x", unlimited, "1 2 #2 =0 @4"}, "1 2 #2 =-9 @4"},
        {{__LINE__, "%d", "-x", unlimited, "#0 =0 @0"}, "#0 =-9 @0"},
        {{__LINE__, "%c%d", "a-x", unlimited, "97 #1 =0 @1"}, "97 #1 =-9 @1"},
        {{__LINE__, "%1d", "-5", unlimited, "#0 =0 @0"}, "#0 =-9 @0"},
        {{__LINE__, "%d", "5\0 6"s, unlimited, "5 #1 =0 @1"}, "5 6 #2 =0 @4"},
        {{__LINE__, "%lo", "10000000000000000000000", 1, "9223372036854775808 #1 =0 @23"},
         "18446744073709551615 #1 =0 @23"},
        {{__LINE__, "%lx", "0x00000000000000000000001", 1, "0 #1 =0 @25"}, "1 #1 =0 @25"},
        {{__LINE__, "%x", "-FFFFFFFFFFFFFFFFFF", 1, "4294967295 #1 =0 @19"}, "0 #1 =0 @19"},
        {{__LINE__, "%x%c", "0xg", unlimited, "0 103 #2 =0 @3"}, "0 120 #2 =-9 @2"},
        {{__LINE__, "%f", "1 nope", unlimited, "1 #1 =-1 @2"}, "1 #1 =-9 @2"},
        {{__LINE__, "%f", "infinity", unlimited, "inf #1 =-1 @3"}, "inf #1 =0 @8"},
        {{__LINE__, "%2f", "inf", unlimited, "inf #1 =0 @3"}, "#0 =-9 @0"},
        {{__LINE__, "%f", "nan -NaN", unlimited, "-nan -nan #2 =0 @8"}, "nan -nan #2 =0 @8"},
        {{__LINE__, "%f%c", "2ex", unlimited, "2 120 #2 =0 @3"}, "2 101 #2 =-9 @2"},
        {{__LINE__, "%f", ".x", unlimited, "#0 =0 @1"}, "#0 =-9 @0"},
    };
    for (const auto& row : rows) {
        expectFromFile(row.row);
        expectFromText(row.row, row.fromText);
    }
}

// A scan goes on where the one before it stopped, whatever it stopped at.
TEST(ScanControl, ContinuesWhereTheLastScanStopped) {
    const std::string text =
        "12 ab-\xE2\x82\xAC"
        "7";
    inputStringStream stream(text.c_str(), static_cast<long>(text.size()), "UTF-8");
    EXPECT_EQ(support::scan(stream, "%d", unlimited).summary(), "12 #1 =-9 @3");
    EXPECT_EQ(support::scan(stream, "abc", unlimited).summary(), "'' #0 =-9 @5");
    EXPECT_EQ(support::scan(stream, "-a", unlimited).summary(), "'' #0 =-9 @6");
    EXPECT_EQ(support::scan(stream, "%[0-9]", unlimited).summary(), "'' #0 =-9 @6");
    EXPECT_EQ(support::scan(stream, "%s", unlimited).summary(),
              "'\xE2\x82\xAC"
              "7' #1 =0 @10");
}

TEST(ScanControl, ReportsTheErrorOfTheFile) {
    for (const char* format : {"%d", "%f", "%s", "%c", "%x"}) {
        support::OpenedFile directory(".");
        EXPECT_EQ(support::scan(directory.stream, format, unlimited).code, EISDIR) << format;
    }
}

TEST(ScanControl, ReportsAReadThatFailsHalfway) {
    const std::string text = "12 -3.5 0x1f ab";
    for (const char* format : {"%s", "%d%*s", "%f%*s", "%i%c", "%u %*s"}) {
        for (std::size_t nth = 1; nth <= text.size(); ++nth) {
            support::FaultyFile faulty{.bytes = text, .failingRead = static_cast<int>(nth)};
            faulty.error = EIO;
            support::OpenedFile opened(faulty.open("r"), "r");
            const support::Scanned scanned = support::scan(opened.stream, format, unlimited);
            const bool happened = faulty.reads >= faulty.failingRead;
            EXPECT_EQ(scanned.code, happened ? EIO : 0) << format << ' ' << nth;
            EXPECT_EQ(opened.stream.getErrorCode(), happened ? EIO : 0) << format << ' ' << nth;
        }
    }
}

// What is stepped back over is what the scanner read, not the byte read before it.
TEST(ScanControl, ScannersForgetTheByteBeforeThem) {
    for (const bool canSeek : {true, false}) {
        support::FaultyFile file{.bytes = "a5b", .failingSeek = canSeek ? 0 : 1, .error = ESPIPE};
        support::OpenedFile opened(file.open("r"), "r");
        EXPECT_EQ(opened.read(1), "a");
        int status = 0;
        EXPECT_EQ(opened.stream.scanInteger(-1, status), 5);
        EXPECT_EQ(opened.stream.Rewind(1), canSeek);
        EXPECT_EQ(opened.read(9), canSeek ? "5b" : "b");
    }
}

TEST(ScanControl, TellsWhetherTheFormatCameRound) {
    EXPECT_TRUE(scanText("1 2", "%d", unlimited).result);
    EXPECT_FALSE(scanText("1", "%d%d", unlimited).result);
    EXPECT_TRUE(scanText("1 2", "%d%d", 1).result);
    EXPECT_FALSE(scanText("1 x", "%d%d", 2).result);
    EXPECT_TRUE(scanText("1 2 x", "%d%d", 3).result);
}

class CountingControl : public scanControl {
public:
    using scanControl::scanControl;
    bool pieceFlag(OutputBuffer& result) override {
        elements += result.GetSize();
        return ++asked != 0;
    }
    int asked = 0;
    std::size_t elements = 0;
};

TEST(ScanControl, AsksForTheFlagOnceAPiece) {
    inputStringStream stream("1,2,3", 5, "");
    finFormatParser parser(u"%d,", &stream);
    OutputBuffer buffer(vxDOUBLE_CLASS, 4, 4, 4);
    unsigned long count = 0;
    parser.InitFormatPieces();
    CountingControl control(2, false, count, stream, parser, buffer);
    EXPECT_TRUE(control.performMainScan());
    EXPECT_EQ(control.asked, 4);
    EXPECT_EQ(control.elements, 0u + 1 + 1 + 2);
    EXPECT_EQ(control.getConversions(), 4u);

    finFormatParser withoutPieces(u"%d", &stream);
    scanControl helpless(0, true, count, stream, withoutPieces, buffer);
    EXPECT_FALSE(helpless.performMainScan());
    EXPECT_EQ(helpless.getError(), 45);
}

// Whichever allocation fails: the host's error, and no block left behind.
TEST(ScanControl, SurvivesExhaustedMemory) {
    const std::size_t before = embedded::liveBlockCount();
    bool happened = true;
    for (std::size_t nth = 1; happened; ++nth) {
        const embedded::FailingAllocation failing(nth);
        bool raised = false;
        try {
            scanText("5 ab cd x1", "%d %s%*s%[a-z]%c", unlimited);
        } catch (const embedded::OutOfMemoryError&) {
            raised = true;
        }
        happened = failing.happened();
        EXPECT_EQ(raised, happened) << "allocation " << nth;
        EXPECT_EQ(embedded::liveBlockCount(), before) << "allocation " << nth;
    }
}

}  // namespace
