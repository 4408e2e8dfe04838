#include "fileio/printf/escape_sequences.h"

#include "embedded/services/messages.h"

#include <string>
#include <vector>

#include <gtest/gtest.h>

namespace {

using builtins::util::convertFormatEscSeqs;
using builtins::util::scanUTF16Value;
using Orvandeil::FileIO::embedded::WarningRecorder;

// Behind a NUL, which is a character like any other.
TEST(FormatEscapes, NameHalfAPairByAQuestionMark) {
    const std::u16string nul(1, u'\0');
    for (const std::u16string half : {u"\xD83D", u"\xDE00", u"\xD83Dz", u"\xDE00z"}) {
        const WarningRecorder recorder;
        std::u16string format = nul + u'\\' + half;
        EXPECT_TRUE(convertFormatEscSeqs(format, false));
        EXPECT_TRUE(format == nul);
        EXPECT_EQ(recorder.warnings().at(0).GetArguments(), std::vector<std::string>{"?"});
    }
}

TEST(ScanValue, SaturatesAndTellsItsEnd) {
    const auto scan = [](int base, const char16_t* text) {
        char16_t* end = nullptr;
        const int value = scanUTF16Value(text, &end, base);
        return std::to_string(value) + " of " + std::to_string(end - text);
    };
    // Only ASCII digits count.
    for (const char16_t* text : {u"", u"-", u"-x", u"+1", u" 1", u"--1", u"\u0661", u"\u0141"})
        EXPECT_EQ(scan(16, text), "0 of 0");
    EXPECT_EQ(scan(10, u"-12a"), "-12 of 3");
    EXPECT_EQ(scan(10, u"2147483647"), "2147483647 of 10");
    EXPECT_EQ(scan(10, u"2147483648"), "2147483647 of 10");
    EXPECT_EQ(scan(10, u"-2147483648"), "-2147483648 of 11");
    EXPECT_EQ(scan(10, u"-2147483647"), "-2147483647 of 11");
    EXPECT_EQ(scan(10, u"99999999999999999999999."), "2147483647 of 23");
    EXPECT_EQ(scan(10, u"-99999999999999999999999"), "-2147483648 of 24");
    EXPECT_EQ(scan(8, u"0178"), "15 of 3");
    EXPECT_EQ(scan(16, u"fFg"), "255 of 2");
    EXPECT_EQ(scan(16, u"0x1"), "0 of 1");
    char16_t* end = nullptr;
    EXPECT_EQ(Orvandeil::FileIO::scanUTF16Octal(u"10", &end), 8);
    EXPECT_EQ(Orvandeil::FileIO::scanUTF16Decimal(u"10", &end), 10);
    EXPECT_EQ(Orvandeil::FileIO::scanUTF16Hex(u"10", &end), 16);
}

}  // namespace
