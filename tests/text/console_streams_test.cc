#include "embedded/services/array.h"
#include "fileio/attributes/file_permission.h"
#include "fileio/constants.h"
#include "fileio/host/exception.h"
#include "fileio/printf/printf_controller.h"
#include "fileio/text/std_err_stream.h"
#include "tests/support/recorded_console.h"

#include <cmath>
#include <cwchar>
#include <functional>
#include <ios>

#include <gtest/gtest.h>

namespace Orvandeil::FileIO {
namespace {

using namespace std::literals;
using support::RecordedConsole;

class ConsoleStreams : public testing::Test {
protected:
    // The fileStream part's counter.
    static unsigned long positionOf(const fileStream& stream) { return stream.getBytesWritten(); }

    RecordedConsole output{vxConsoleOutput()};
    RecordedConsole error{vxConsoleError()};
    FilePermission permission{"w", false};
    outputScreenStream out{stdout, permission};
    stdErrStream err{stderr, permission};
};

TEST_F(ConsoleStreams, BytesLoseTheirNuls) {
    const struct {
        int line;
        std::string_view bytes;
        const char* shown;
    } rows[] = {
        {__LINE__, "ab\0cd"sv, "abcd"},
        {__LINE__, "\0\0a\0"sv, "a"},
        {__LINE__, "\0"sv, ""},
        {__LINE__, "", ""},
        {__LINE__, "\xC3\xA9"sv, "\xC3\xA9"},
    };
    unsigned long total = 0;
    for (const auto& row : rows) {
        output.text.clear();
        EXPECT_EQ(out.PutNElements(row.bytes.size(), row.bytes.data(), 1), row.bytes.size());
        EXPECT_EQ(output.text, row.shown) << "line " << row.line;
        total += row.bytes.size();
    }
    EXPECT_EQ(out.PutNElements(2, "abcdef", 3), 6u);
    EXPECT_EQ(out.getConsoleBytesWritten(), total + 6);
    EXPECT_EQ(positionOf(out), total + 6);
    EXPECT_ANY_THROW(out.PutNElements(1UL << 62, "", 8));
}

TEST_F(ConsoleStreams, TextIsCountedInUnitsAndInBytes) {
    EXPECT_EQ(out.PutNCharacters(3, u"a\0b"), 3u);
    EXPECT_EQ(out.PutString(u"\u00E9\U0001F600"), 3u);
    EXPECT_EQ(out.PutNCharacters(0, nullptr), 0u);
    EXPECT_EQ(output.text, "a b\xC3\xA9\xF0\x9F\x98\x80");
    EXPECT_EQ(out.getConsoleBytesWritten(), 12u);
    EXPECT_EQ(positionOf(out), 6u);

    output.text.clear();
    const std::u16string longText(10001, u'\u3042');
    out.PutString(longText);
    EXPECT_EQ(output.text.size(), 3 * longText.size());
}

// A pair cut in two is one character; a lone half shows as U+FFFD, in its place.
TEST_F(ConsoleStreams, HighSurrogateWaits) {
    const char16_t* pair = u"\U0001F600";
    out.PutNCharacters(1, pair);
    EXPECT_EQ(output.text, "");
    out.PutNCharacters(1, pair + 1);
    EXPECT_EQ(output.text, "\xF0\x9F\x98\x80");
    output.text.clear();
    out.PutNCharacters(1, pair);
    out.printf("%d", 5);
    out.PutNCharacters(1, pair);
    out.PutString(u"x");
    EXPECT_EQ(output.text,
              "\xEF\xBF\xBD"
              "5\xEF\xBF\xBDx");
}

TEST_F(ConsoleStreams, PrintNeedsNoPromise) {
    for (const int width : {0, 1, static_cast<int>(constants::numberScratchBytes) - 1,
                            static_cast<int>(constants::numberScratchBytes), 5000}) {
        output.text.clear();
        const std::string expected(static_cast<std::size_t>(std::max(0, width - 1)), ' ');
        EXPECT_EQ(out.printf("%*d", width, 7), std::max(1, width));
        EXPECT_EQ(output.text, expected + '7');
    }
    const std::size_t before = out.getConsoleBytesWritten();
    EXPECT_LT(out.printf("%lc", static_cast<wint_t>(0x3042)), 0);  // not in the "C" locale
    output.fails = true;
    EXPECT_EQ(out.printf("%d", 1), 0);
    EXPECT_EQ(out.getConsoleBytesWritten(), before);
    EXPECT_EQ(positionOf(out), before);
}

TEST_F(ConsoleStreams, FlushTellsTheBadBit) {
    EXPECT_EQ(out.flush(), 1);
    EXPECT_EQ(output.flushes, 1);
    output.fails = true;
    EXPECT_EQ(out.PutString(u"lost"), 4u);
    EXPECT_EQ(out.flush(), 0);
    EXPECT_EQ(err.flush(), 1);
    EXPECT_EQ(out.getErrorCode(), 0);
    vxConsoleOutput()->throwsWhenBad = true;
    const std::size_t before = out.getConsoleBytesWritten();
    EXPECT_THROW(out.PutString(u"lost"), std::ios_base::failure);
    EXPECT_EQ(out.getConsoleBytesWritten(), before);
}

TEST_F(ConsoleStreams, ErrorsGoToTheErrorSink) {
    err.PutNElements(3, "a\0b", 1);
    err.printf("%d", 12);
    EXPECT_EQ(output.flushes, 0);
    EXPECT_EQ(error.flushes, 2);
    err.PutString(u"text");
    out.PutString(u"out");
    EXPECT_EQ(error.text, "ab12text");
    EXPECT_EQ(output.text, "out");
    EXPECT_EQ(err.getConsoleBytesWritten(), 13u);
    EXPECT_EQ(positionOf(err), 9u);

    // The redirection ends with a failed call, too.
    EXPECT_ANY_THROW(err.PutNElements(1UL << 62, "", 8));
    EXPECT_TRUE(vxConsoleOutput()->redirections.empty());
}

TEST_F(ConsoleStreams, NumbersAndTextKeepOneOrder) {
    const embedded::ArrayPtr values = embedded::makeDoubles(1, 3, {1, 2.5, NAN});
    const embedded::ArrayPtr text = embedded::makeChars(u"\u00E9t\u00E9");
    const vxArray* arguments[] = {values.get(), text.get()};
    printfController controller(u"<%5.1f|%g %x %s>\n", &out, arguments, 2);
    EXPECT_TRUE(controller.doPrintf());
    EXPECT_EQ(output.text, "<  1.0|2.5 NaN \xC3\xA9t\xC3\xA9>\n");
}

TEST_F(ConsoleStreams, WhatAConsoleIs) {
    long position = 3;
    EXPECT_EQ(err.getPosition(position), 0);
    EXPECT_EQ(position, -1);
    EXPECT_EQ(out.setPosition(0), -1);
    EXPECT_TRUE(out.isScreen());
    EXPECT_TRUE(out.isFileOpen());
    EXPECT_FALSE(out.EndOfData());
    EXPECT_TRUE(out.needsBufferSize());
    EXPECT_EQ(out.GetEncodingName(), "UTF-16");
    out.clearError();
}

TEST_F(ConsoleStreams, RefuseTheRest) {
    screenStreamBase base(stdout, permission);
    OutputBuffer buffer(vxUINT8_CLASS, 0, 0, 0);
    OutputBuffer line(vxCHAR_CLASS, 0, 0, 0);
    int status = 5;
    bool flag = false;
    const struct {
        int line;
        std::function<void()> call;
    } rows[] = {
        {__LINE__, [&] { base.printf("%d", 1); }},
        {__LINE__, [&] { base.PutNElements(1, "a", 1); }},
        {__LINE__, [&] { base.PutString(u"a"); }},
        {__LINE__, [&] { base.flush(); }},
        {__LINE__, [&] { base.setBufferSize(1); }},
        {__LINE__, [&] { out.getByte(); }},
        {__LINE__, [&] { out.GetNElements(1, buffer, 1); }},
        {__LINE__, [&] { out.GetLine(-1, line); }},
        {__LINE__, [&] { out.Rewind(1); }},
        {__LINE__, [&] { err.scanOctal(-1, status, flag); }},
        {__LINE__, [&] { err.scanInteger(-1, status); }},
        {__LINE__, [&] { err.scanIntegerCouldBeHex(-1, status); }},
        {__LINE__, [&] { err.scanFloat(-1, status); }},
    };
    for (const auto& row : rows) {
        try {
            row.call();
            ADD_FAILURE() << "no error, line " << row.line;
        } catch (const foundation::core::except::IMsgIDException& refusal) {
            EXPECT_EQ(refusal.GetID(), "KESTRA:legacy_two_part:notimplemented_vx")
                << "line " << row.line;
        }
    }
    EXPECT_EQ(status, 5);
}

}  // namespace
}  // namespace Orvandeil::FileIO
