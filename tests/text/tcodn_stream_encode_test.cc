#include "tests/text/memory_stream.h"

#include <clocale>

#include <gtest/gtest.h>

namespace Orvandeil::FileIO {
namespace {

using namespace std::string_literals;

TEST(Encoding, CountsByEncoding) {
    const auto put = [](const char* encoding, std::u16string_view text, std::size_t limit) {
        MemoryStream stream(encoding);
        stream.outputLimit = limit;
        return stream.PutString(text);
    };
    EXPECT_EQ(put("ISO-8859-1", u"abc", 9), 3U);
    EXPECT_EQ(put("ISO-8859-1", u"abc", 2), 2U);
    EXPECT_EQ(put("ISO-8859-1", u"\U0001F600", 9), 1U);
    EXPECT_EQ(put("ISO-8859-1", u"\xD83D", 9), 0U);
    EXPECT_EQ(put("UTF-32", u"abc", 99), 4U) << "the mark is counted";
    EXPECT_EQ(put("UTF-32BE", u"abc", 9), 2U);
    EXPECT_EQ(put("UTF-16BE", u"a\U0001F600", 9), 3U);
    EXPECT_EQ(put("UTF-8", u"ab\u3042", 9), 3U);
    EXPECT_EQ(put("UTF-8", u"ab\u3042", 4), 0U);
    EXPECT_EQ(put("UTF-8", u"\xD83D", 9), 1U);
    EXPECT_EQ(put("UTF-16", u"abc", 5), 2U);
    EXPECT_EQ(put("", u"", 9), 0U);
}

TEST(Encoding, Utf16GoesOutAsItIsWithoutAMark) {
    for (const char* name : {"", "utf16", "unicode", "ucs-2"}) {
        MemoryStream stream(name);
        stream.detected = "UTF-16";
        EXPECT_EQ(stream.PutString(nullptr, 4), 0U);
        EXPECT_TRUE(stream.detections.empty());
        EXPECT_EQ(stream.PutString(u"a\xDE00"), 2U);
        EXPECT_EQ(stream.PutASCIIString("b", 1), 1);
        EXPECT_EQ(stream.output, "a\0\0\xDE\142\0"s);
        EXPECT_EQ(stream.detections.size(), *name ? 0U : 1U);
    }
}

TEST(TcodnStream, KeepsTheLastConverterFailure) {
    const UErrorCode failures[] = {U_INVALID_CHAR_FOUND,    U_TRUNCATED_CHAR_FOUND,
                                   U_ILLEGAL_CHAR_FOUND,    U_INVALID_TABLE_FORMAT,
                                   U_BUFFER_OVERFLOW_ERROR, U_MEMORY_ALLOCATION_ERROR};
    MemoryStream stream("UTF-8");
    for (int code = -37; const UErrorCode failure : failures) {
        stream.CheckStatus(failure);
        stream.CheckStatus(U_AMBIGUOUS_ALIAS_WARNING);
        EXPECT_EQ(stream.getErrorCode(), code--);
    }
}

TEST(TcodnStream, MakesThePointADecimalPoint) {
    if (!std::setlocale(LC_NUMERIC, "C.UTF-8")) GTEST_SKIP() << "no second locale here";
    MemoryStream stream("");
    EXPECT_STREQ(std::setlocale(LC_NUMERIC, nullptr), "C");
}

}  // namespace
}  // namespace Orvandeil::FileIO
