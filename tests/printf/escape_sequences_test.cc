#include "fileio/printf/escape_sequences.h"

#include "embedded/services/messages.h"
#include "fileio/errors/identifiers.h"

#include <climits>

#include <gtest/gtest.h>

namespace {

using builtins::util::convertFormatEscSeqs;
using builtins::util::scanUTF16Value;
using Orvandeil::FileIO::embedded::WarningRecorder;

struct Conversion {
    int line;
    std::u16string format;
    std::u16string converted;
    const char* warning;  // after the component; empty: none
};

const std::u16string nul(1, u'\0');

const Conversion conversions[] = {
    {__LINE__, u"", u"", ""},
    {__LINE__, uR"(a\tb\n)", u"a\tb\n", ""},
    {__LINE__, uR"(\f\r\\\'\"\?\a\b\v)", u"\f\r\\'\"?\a\b\v", ""},
    {__LINE__, uR"(\101\x42)", u"AB", ""},
    {__LINE__, uR"(\45d)", u"%d", ""},
    {__LINE__, uR"(\0128)", u"\n8", ""},
    {__LINE__, uR"(\1Fg)", u"\1Fg", ""},
    {__LINE__, uR"(\x41g\X)", u"Ag", "BadEscapeSequenceInFormat"},
    {__LINE__, uR"(a\0b)", u"a" + nul + u"b", ""},
    {__LINE__, u"a" + nul + uR"(\n)", u"a" + nul + u"\n", ""},
    {__LINE__, uR"(\177777\xFfFf\x0000000041)",
     u"\xFFFF\xFFFF"
     u"A",
     ""},
    {__LINE__, uR"(é\xd83d\xde00)", u"é\U0001F600", ""},
    {__LINE__, uR"(a\9)", u"a", "OctalCharCodeInvalid"},
    {__LINE__, uR"(a\x)", u"a", "HexCharCodeInvalid"},
    {__LINE__, uR"(a\x-41)", u"a", "HexCharCodeInvalid"},
    {__LINE__, uR"(a\x\n)", u"a", "HexCharCodeInvalid"},
    {__LINE__, uR"(a\200000b)", u"a", "OctalCharCodeOutOfRange"},
    {__LINE__, uR"(a\77777777777777777777)", u"a", "OctalCharCodeOutOfRange"},
    {__LINE__, uR"(a\x10000b)", u"a", "HexCharCodeOutOfRange"},
    {__LINE__, uR"(abc\)", u"abc", "NoControlCharacterInFormat"},
    {__LINE__, uR"(\n\%\n)", u"\n", "BadEscapeSequenceInFormat"},
    {__LINE__, u"a\\" + nul, u"a", "BadEscapeSequenceInFormat"},
};

TEST(FormatEscapes, Conversions) {
    for (const Conversion& row : conversions) {
        SCOPED_TRACE(row.line);
        WarningRecorder recorder;
        std::u16string format = row.format;
        const bool stopped = convertFormatEscSeqs(format, false);
        EXPECT_TRUE(format == row.converted);
        EXPECT_EQ(stopped, *row.warning != '\0');
        const std::vector<std::string> expected(stopped ? 1 : 0,
                                                std::string("KESTRA:printf:") + row.warning);
        EXPECT_EQ(recorder.identifiers(), expected);
    }
}

TEST(FormatEscapes, OnlyTheUnknownEscapeIsEverAnError) {
    using BadEscape = KESTRA::printf::BadEscapeSequenceInFormat;
    for (const Conversion& row : conversions) {
        SCOPED_TRACE(row.line);
        WarningRecorder recorder;
        std::u16string format = row.format;
        const bool unknown = std::string(row.warning) == "BadEscapeSequenceInFormat";
        try {
            convertFormatEscSeqs(format, true);
            EXPECT_FALSE(unknown);
        } catch (const foundation::core::except::Exception<BadEscape, std::exception>&) {
            EXPECT_TRUE(unknown);
            EXPECT_TRUE(format == row.format);
        }
    }
}

TEST(FormatEscapes, UnknownEscapeCarriesTheWholeCharacter) {
    const struct {
        int line;
        std::u16string format;
        std::string argument;
    } rows[] = {
        {__LINE__, uR"(100\%)", "%"},
        {__LINE__, u"\\\u00e9", "\u00e9"},
        {__LINE__, u"\\\U0001F600", "\U0001F600"},
        {__LINE__, std::u16string(u"\\") + char16_t(0xD83D), "?"},
        {__LINE__, std::u16string(u"\\") + char16_t(0xDE00) + u"a", "?"},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.line);
        WarningRecorder recorder;
        std::u16string format = row.format;
        convertFormatEscSeqs(format, false);
        ASSERT_EQ(recorder.warnings().size(), 1u);
        EXPECT_EQ(recorder.warnings()[0].GetArguments(), std::vector{row.argument});
    }
}

TEST(ScanValue, SaturatesAndTellsItsEnd) {
    const struct {
        int line;
        int base;
        const char16_t* text;
        int value;
        long taken;
    } rows[] = {
        {__LINE__, 10, u"", 0, 0},
        {__LINE__, 10, u"-", 0, 0},
        {__LINE__, 10, u"-x", 0, 0},
        {__LINE__, 10, u"+1", 0, 0},
        {__LINE__, 10, u" 1", 0, 0},
        {__LINE__, 10, u"--1", 0, 0},
        {__LINE__, 10, u"-12a", -12, 3},
        {__LINE__, 10, u"2147483647", INT_MAX, 10},
        {__LINE__, 10, u"2147483648", INT_MAX, 10},
        {__LINE__, 10, u"-2147483648", INT_MIN, 11},
        {__LINE__, 10, u"-2147483647", -INT_MAX, 11},
        {__LINE__, 10, u"99999999999999999999999.", INT_MAX, 23},
        {__LINE__, 10, u"-99999999999999999999999", INT_MIN, 24},
        {__LINE__, 8, u"0178", 15, 3},
        {__LINE__, 16, u"fFg", 255, 2},
        {__LINE__, 16, u"0x1", 0, 1},
        {__LINE__, 10, u"\u0661", 0, 0},  // only ASCII digits count
        {__LINE__, 16, u"\u0141", 0, 0},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.line);
        char16_t* end = nullptr;
        EXPECT_EQ(scanUTF16Value(row.text, &end, row.base), row.value);
        EXPECT_EQ(end - row.text, row.taken);
    }
}

TEST(ScanValue, EntryPointsFixTheBase) {
    char16_t* end = nullptr;
    EXPECT_EQ(Orvandeil::FileIO::scanUTF16Octal(u"10", &end), 8);
    EXPECT_EQ(Orvandeil::FileIO::scanUTF16Decimal(u"10", &end), 10);
    EXPECT_EQ(Orvandeil::FileIO::scanUTF16Hex(u"10", &end), 16);
}

}  // namespace
