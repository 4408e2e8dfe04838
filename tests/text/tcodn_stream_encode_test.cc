#include "tests/text/memory_stream.h"

#include <clocale>
#include <random>

#include <gtest/gtest.h>

namespace Orvandeil::FileIO {
namespace {

using namespace std::string_literals;

// A last unit that waits for its partner stays in the converter, as in the stream.
std::string encodedAtOnce(const char* encoding, const std::u16string& text) {
    UErrorCode status = U_ZERO_ERROR;
    UConverter* converter = ucnv_open(encoding, &status);
    std::string bytes(text.size() * 12 + 16, '\0');
    char* target = bytes.data();
    const char16_t* source = text.data();
    ucnv_fromUnicode(converter, &target, target + bytes.size(), &source, source + text.size(),
                     nullptr, false, &status);
    ucnv_close(converter);
    EXPECT_TRUE(U_SUCCESS(status));
    bytes.resize(static_cast<std::size_t>(target - bytes.data()));
    return bytes;
}

TEST(Encoding, DoesNotDependOnWhereTheTextIsCut) {
    std::mt19937 random(1);
    const std::u16string alphabet = u"ab\u00E9\u3042\u30A2\u0416\U0001F600\xD83D\xDE01\xFFFD";
    for (unsigned round = 0; round < 1210; ++round) {
        const char* encoding =
            round % 2 ? statefulEncodings[round / 2 % 3] : statelessEncodings[round / 2 % 10];
        // The last rounds take texts of which some grow the scratch many times over.
        std::u16string text(random() % (round < 1200 ? 90 : 100000), u'\0');
        std::generate(text.begin(), text.end(),
                      [&] { return alphabet[random() % alphabet.size()]; });
        MemoryStream stream(encoding);
        int calls = 0;
        for (std::size_t n, at = 0; at < text.size(); at += n, ++calls) {
            n = 1 + random() % (text.size() / 3 + 1);
            stream.PutString(std::u16string_view(text).substr(at, n));
        }
        EXPECT_EQ(stream.output, encodedAtOnce(encoding, text)) << encoding << " " << round;
        EXPECT_EQ(stream.writes, calls);
        EXPECT_EQ(stream.getErrorCode(), 0);
    }
}

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
