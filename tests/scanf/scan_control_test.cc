#include "fileio/scanf/scan_control.h"

#include "embedded/services/memory.h"
#include "fileio/text/input_string_stream.h"
#include "tests/support/raised.h"
#include "tests/support/scanning.h"
#include "tests/support/test_files.h"

#include <cerrno>

#include <gtest/gtest.h>

namespace {

using namespace Orvandeil::FileIO;
using namespace std::string_literals;
using support::scanText;
using support::unlimited;

const struct Row {
    int line;
    const char* format;
    std::string input;
    std::string expected;
    long limit = unlimited;
    std::string fromText = "";  // when a text gives something else than a file
} rows[] = {
    {__LINE__, "%d", "1 2 3", "1 2 3 #3 =0 @5"},
    {__LINE__, "%d", "1 2 3\n", "1 2 3 #3 =0 @6"},
    {__LINE__, "%d", "1 2 3", "1 2 #2 =0 @3", 2},
    {__LINE__, "%d", "", "#0 =0 @0"},
    {__LINE__, "%d,", "1,2,3", "1 2 3 #3 =0 @5"},
    {__LINE__, "%d,", "1;2", "1 #1 =-9 @1"},
    // Text behind the last value.
    {__LINE__, "%d abc", "5 abc", "5 #1 =0 @5", 1},
    {__LINE__, "%d,", "1;2", "1 #1 =-9 @1", 1},
    {__LINE__, "%d,%d", "1,2,3", "1 #1 =0 @2", 1},
    {__LINE__, "%d;%d,", "1;2,3;4,", "1 2 #2 =0 @4", 2},
    {__LINE__, "abc%d", "abc5", "#0 =0 @3", 0},
    // Formats that store nothing.
    {__LINE__, "abc", "abcabc", "'' #0 =0 @3"},
    {__LINE__, "abc", "abx", "'' #0 =-9 @2"},
    {__LINE__, "abc", "ab", "'' #0 =0 @2"},
    {__LINE__, "%*d", "1 2 3", "#0 =0 @3", 2},
    {__LINE__, "%*d%*d", "1 2 3 4 5", "#0 =0 @5", 3},
    {__LINE__, "%*d%*d", "1 2 3 4 5", "#0 =0 @9", 1},
    {__LINE__, "%*d %*[a-z]", "1 ab 2 cd", "#0 =0 @9"},
    // Percent signs.
    {__LINE__, "%%%d", "%5", "5 #1 =0 @2", 1},
    {__LINE__, "%%%d", "x5", "#0 =-9 @0", 1},
    {__LINE__, "%d%%", "5%6%", "5 6 #2 =0 @4"},
    {__LINE__, "%d%%x", "5%x", "5 #1 =0 @3", 1},
    {__LINE__, "%%a%d", "%a%", "'' #0 =0 @3"},
    {__LINE__, "%d %q", "1 2", "1 #1 =-8 @2"},
    {__LINE__, "%d %q", "1 2", "1 #1 =0 @2", 1},
    // Numbers.
    {__LINE__, "%hd", "32768 -32769 99999999999999999999", "32767 -32768 32767 #3 =0 @33"},
    {__LINE__, "%d", "2147483648 -2147483649", "2147483647 -2147483648 #2 =0 @22"},
    {__LINE__, "%ld", "-9223372036854775809 9007199254740993",
     "-9223372036854775808 9007199254740993 #2 =0 @37"},
    {__LINE__, "%hu", "-1 -65535 -65536 -70000 65536 -0", "65535 1 0 0 65535 0 #6 =0 @32"},
    {__LINE__, "%u", "4294967296 -1 -4294967296", "4294967295 4294967295 0 #3 =0 @25"},
    {__LINE__, "%lu", "-1 18446744073709551616",
     "18446744073709551615 18446744073709551615 #2 =0 @23"},
    {__LINE__, "%x", "1f 0X1F -0x1 ffffffffff", "31 31 4294967295 4294967295 #4 =0 @23"},
    {__LINE__, "%o", "17 -1 8", "15 4294967295 #2 =0 @5", 2},
    {__LINE__, "%i", "0x1F 010 10 08", "31 8 10 0 8 #5 =0 @14"},
    {__LINE__, "%2d%3d", "123456", "12 345 6 #3 =0 @6"},
    {__LINE__, "%f", "1 -2.5e3 .5 Inf -inf 1e999", "1 -2500 0.5 inf -inf inf #6 =0 @26"},
    {__LINE__, "%hf", "0.1 1e300", "0.10000000149011612 inf #2 =0 @9"},
    {__LINE__, "%3lg", "1.2345", "1.2 345 #2 =0 @6"},
    // A number out of range leaves no error behind for the end of the data.
    {__LINE__, "%d%s", "99999999999999999999", "2147483647 #1 =0 @20"},
    {__LINE__, "%f%c", "1e999", "inf #1 =0 @5"},
    // Words and characters.
    {__LINE__, "%s", "  ab\tcd ", "'abcd' #2 =0 @8"},
    {__LINE__, "%3s", "abcdefg", "'abcdefg' #3 =0 @7"},
    {__LINE__, "%s%c", "a\u00A0z\u3000b", "'a\u00A0z\u3000b' #3 =0 @8"},
    {__LINE__, "%c", " a\0"s, "' a\0' #3 =0 @3"s},
    {__LINE__, " %c", " \r\n\u2003é b ", "'éb' #2 =0 @11"},
    {__LINE__, "%*2c%c", "abcdef", "'cf' #2 =0 @6"},
    {__LINE__, "%2147483647c", "ab", "'ab' #1 =0 @2"},
    {__LINE__, "%s%ld", "ab 5", "97 98 5 #2 =0 @4"},
    // Sets.
    {__LINE__, "%[0-9]", "123abc", "'123' #1 =-9 @3"},
    {__LINE__, "%[9-0]", "123abc", "'123' #1 =0 @3", 1},
    {__LINE__, "%[^]-]", "ab]", "'ab' #1 =0 @2", 1},
    {__LINE__, "%[]-]", "]-]a", "']-]' #1 =0 @3", 1},
    {__LINE__, "%[-a]", "-a-b", "'-a-' #1 =0 @3", 1},
    {__LINE__, "%[a-c-e]", "abc-ed", "'abc-e' #1 =0 @5", 1},
    {__LINE__, "%[]-a]", "]^_`ab", "']^_`a' #1 =0 @5", 1},
    {__LINE__, "%[--a]", "-09Aab", "'-09Aa' #1 =0 @5", 1},
    {__LINE__, "%*[a^]%2[b]%[c]", "a^bbbc", "'bb' #1 =-9 @4"},
    {__LINE__, "%f%[a-c]", "1.5abc", "1.5 97 98 99 #2 =0 @6"},
    // Characters beyond ASCII; those beyond the Basic Multilingual Plane are U+001A.
    {__LINE__, "%c€%c", "aäb", "'a' #1 =-9 @1"},
    {__LINE__, "%[ä-€]%c", "äö€x", "'äö€x' #2 =0 @8"},
    {__LINE__, "%[😀-😂x]", "x😁", "'x' #1 =0 @1", 1},
    {__LINE__, "%s", "😀a", "'\032a' #1 =0 @5"},
    {__LINE__, "😀", "😀", "'' #0 =-9 @0"},
    // Files and texts differ.
    {__LINE__, "%d", "1 2 x", "1 2 #2 =0 @4", unlimited, "1 2 #2 =-9 @4"},
    {__LINE__, "%x%c", "0xg", "0 103 #2 =0 @3", unlimited, "0 120 #2 =-9 @2"},
    {__LINE__, "%f", "1 nope", "1 #1 =-1 @2", unlimited, "1 #1 =-9 @2"},
};

// A pipe gives what a file gives, but knows no position.
TEST(ScanControl, ScansFilesPipesAndTexts) {
    for (const Row& row : rows) {
        SCOPED_TRACE(row.line);
        const support::Scanned fromPipe = support::scanPipe(row.input, row.format, row.limit);
        EXPECT_EQ(support::scanFile(row.input, row.format, row.limit).summary(), row.expected);
        EXPECT_EQ(fromPipe.summary(), row.expected.substr(0, row.expected.rfind(" @")));
        EXPECT_EQ(scanText(row.input, row.format, row.limit).summary(),
                  row.fromText.empty() ? row.expected : row.fromText);
    }
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

// Whichever allocation fails: the host's error, and no block left behind.
TEST(ScanControl, SurvivesExhaustedMemory) {
    const std::size_t before = embedded::liveBlockCount();
    bool happened = true;
    for (std::size_t nth = 1; happened; ++nth) {
        const embedded::FailingAllocation failing(nth);
        const std::string raised =
            fileio_tests::raisedBy([] { scanText("5 ab cd x1", "%d %s%*s%[a-z]%c", unlimited); });
        happened = failing.happened();
        EXPECT_EQ(raised, happened ? "KESTRA:nomem" : "") << "allocation " << nth;
        EXPECT_EQ(embedded::liveBlockCount(), before) << "allocation " << nth;
    }
}

}  // namespace
