#include "fileio/printf/escape_sequences.h"

#include "embedded/services/messages.h"
#include "tests/support/raised.h"

#include <string>

#include <gtest/gtest.h>

namespace {

using builtins::util::convertFormatEscSeqs;
using builtins::util::scanUTF16Value;
using Orvandeil::FileIO::embedded::WarningRecorder;

const std::u16string nul(1, u'\0');

const struct {
    int line;
    std::u16string format;
    std::u16string converted;
    const char* warning = "";  // after the component, with its argument
} rows[] = {
    {__LINE__, u"", u""},
    {__LINE__, uR"(a\0b)" + nul + uR"(\n)", u"a" + nul + u"b" + nul + u"\n"},
    {__LINE__, uR"(\x41g\X)", u"Ag", "BadEscapeSequenceInFormat X"},
    {__LINE__, u"\\\U0001F600", u"", "BadEscapeSequenceInFormat \U0001F600"},
    {__LINE__, u"a\\\xD83D", u"a", "BadEscapeSequenceInFormat ?"},
    {__LINE__,
     u"\\\xDE00"
     u"a",
     u"", "BadEscapeSequenceInFormat ?"},
};

// Only the unknown escape is ever an error, and then the format stays.
TEST(FormatEscapes, Conversions) {
    for (const auto& row : rows) {
        SCOPED_TRACE(row.line);
        const std::string warning = *row.warning ? std::string("KESTRA:printf:") + row.warning : "";
        const bool isUnknown = warning.find("BadEscape") != warning.npos;
        for (const bool strict : {false, true}) {
            const WarningRecorder recorder;
            std::u16string format = row.format;
            bool stopped = true;
            std::string told =
                fileio_tests::raisedBy([&] { stopped = convertFormatEscSeqs(format, strict); });
            EXPECT_EQ(!told.empty(), strict && isUnknown);
            for (const auto& id : recorder.warnings()) {
                told += id.GetIdentifier();
                for (const std::string& argument : id.GetArguments())
                    told += ' ' + argument;
            }
            EXPECT_EQ(told, warning);
            EXPECT_EQ(stopped, !warning.empty());
            EXPECT_TRUE(format == (strict && isUnknown ? row.format : row.converted));
        }
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
