#include "fileio/attributes/file_permission.h"
#include "fileio/text/std_err_stream.h"
#include "tests/support/raised.h"
#include "tests/support/recorded_console.h"

#include <ios>

#include <gtest/gtest.h>

namespace Orvandeil::FileIO {
namespace {

using namespace std::literals;

class ConsoleStreams : public testing::Test {
protected:
    // The console's bytes, and the fileStream part's positions.
    void expectCounts(const outputScreenStream& stream, std::size_t bytes, std::size_t positions) {
        EXPECT_EQ(stream.getConsoleBytesWritten(), bytes);
        EXPECT_EQ(stream.getBytesWritten(), positions);
    }

    support::RecordedConsole output{vxConsoleOutput()};
    support::RecordedConsole error{vxConsoleError()};
    FilePermission permission{"w", false};
    outputScreenStream out{stdout, permission};
    stdErrStream err{stderr, permission};
};

TEST_F(ConsoleStreams, BytesLoseTheirNuls) {
    for (const std::string_view bytes : {"ab\0cd"sv, "\0\0e\0"sv, "\0"sv, ""sv, "\xC3\xA9"sv})
        EXPECT_EQ(out.PutNElements(bytes.size(), bytes.data(), 1), bytes.size());
    EXPECT_EQ(out.PutNElements(2, "fghijk", 3), 6u);
    EXPECT_EQ(output.text, "abcde\xC3\xA9\146ghijk");
    expectCounts(out, 18, 18);
}

// A pair cut in two is one character; a lone half shows as U+FFFD, in its place.
TEST_F(ConsoleStreams, TextIsCountedInUnitsAndInBytes) {
    const char16_t* pair = u"\U0001F600";
    EXPECT_EQ(out.PutNCharacters(3, u"a\0b"), 3u);
    EXPECT_EQ(out.PutString(u"\u00E9\xD83D"), 2u);
    out.PutNCharacters(1, pair + 1);
    out.PutNCharacters(1, pair);
    out.printf("%d", 5);
    EXPECT_EQ(output.text, "a b\xC3\xA9\xF0\x9F\x98\x80\xEF\xBF\xBD\65");
    expectCounts(out, 15, 8);
    out.PutString(std::u16string(10001, u'\u3042'));
    EXPECT_EQ(output.text.size(), 13u + 3 * 10001);
    output.text.clear();
    EXPECT_EQ(out.printf("a%c%70000d", 0, 7), 70002);
    EXPECT_EQ(output.text, "a");
}

TEST_F(ConsoleStreams, FlushTellsTheBadBit) {
    EXPECT_EQ(out.flush(), 1);
    EXPECT_EQ(output.flushes, 1);
    output.fails = true;
    EXPECT_EQ(out.PutString(u"lost"), 4u);
    EXPECT_EQ(out.flush(), 0);
    EXPECT_EQ(err.flush(), 1);
    EXPECT_EQ(out.printf("%d", 1), 0);
    EXPECT_EQ(out.getErrorCode(), 0);
    vxConsoleOutput()->throwsWhenBad = true;
    EXPECT_THROW(out.PutString(u"lost"), std::ios_base::failure);
    expectCounts(out, 8, 4);
}

TEST_F(ConsoleStreams, ErrorsGoToTheErrorSink) {
    err.PutNElements(3, "a\0b", 1);
    err.printf("%d", 12);
    EXPECT_EQ(output.flushes, 0);
    EXPECT_EQ(error.flushes, 2);
    err.PutString(u"text");
    // The redirection ends with a failed call, too.
    EXPECT_ANY_THROW(err.PutNElements(1UL << 62, "", 8));
    out.PutString(u"out");
    EXPECT_EQ(error.text, "ab12text");
    EXPECT_EQ(output.text, "out");
    expectCounts(err, 13, 9);
}

TEST_F(ConsoleStreams, RefuseWhatNoConsoleCan) {
    screenStreamBase base(stdout, permission);
    OutputBuffer buffer(vxCHAR_CLASS, 0, 0, 0);
    int status = 5;
    bool flag = false;
    const auto refuses = [](const auto& call) {
        return fileio_tests::raisedBy(call) == "KESTRA:legacy_two_part:notimplemented_vx";
    };
    EXPECT_TRUE(refuses([&] { base.printf("%d", 1); }) && refuses([&] { base.setBufferSize(1); }));
    EXPECT_TRUE(refuses([&] { base.PutNElements(1, "a", 1); }) && refuses([&] { base.flush(); }));
    EXPECT_TRUE(refuses([&] { base.PutString(u"a"); }) && refuses([&] { out.getByte(); }));
    EXPECT_TRUE(refuses([&] { out.GetNElements(1, buffer, 1); }));
    EXPECT_TRUE(refuses([&] { out.GetLine(-1, buffer); }) && refuses([&] { out.Rewind(1); }));
    EXPECT_TRUE(refuses([&] { err.scanOctal(-1, status, flag); }));
    EXPECT_TRUE(refuses([&] { err.scanInteger(-1, status); }));
    EXPECT_TRUE(refuses([&] { err.scanIntegerCouldBeHex(-1, status); }));
    EXPECT_TRUE(refuses([&] { err.scanFloat(-1, status); }));
    long position = 3;
    EXPECT_TRUE(err.getPosition(position) == 0 && position == -1 && out.setPosition(0) == -1);
    EXPECT_TRUE(out.isScreen() && out.isFileOpen() && out.needsBufferSize() && !out.EndOfData());
    EXPECT_EQ(out.GetEncodingName(), "UTF-16");
}

}  // namespace
}  // namespace Orvandeil::FileIO
