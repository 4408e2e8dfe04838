#include "fileio/scanf/scan_control.h"

#include "fileio/text/input_string_stream.h"
#include "tests/support/scanning.h"
#include "tests/support/test_files.h"

#include <cerrno>

#include <gtest/gtest.h>

namespace {

using namespace Orvandeil::FileIO;
using support::scanText;
using support::unlimited;

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
