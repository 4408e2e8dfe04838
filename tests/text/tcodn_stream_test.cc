#include "tests/support/raised.h"
#include "tests/text/memory_stream.h"

#include <clocale>

#include <gtest/gtest.h>

namespace Orvandeil::FileIO {
namespace {

using namespace std::literals;
using namespace std::string_literals;

std::u16string contents(OutputBuffer& buffer) {
    std::u16string units;
    buffer.ResetNext();
    while (const void* unit = buffer.GetNext())
        units += *static_cast<const char16_t*>(unit);
    return units;
}

TEST(Decoding, FillsBuffers) {
    std::string bytes;
    for (int i = 0; i < 300; ++i)
        bytes += "a\xC3\xA9\xE3\x81\x82 z";
    const std::u16string expected = decodedAtOnce("UTF-8", bytes);
    std::size_t consumed = 99;
    for (const unsigned long n : {0UL, 1UL, 70UL, 240UL, 1UL << 40}) {
        MemoryStream stream("UTF-8", bytes);
        OutputBuffer buffer(vxCHAR_CLASS, 4, 4, 16);
        EXPECT_EQ(stream.GetNCodePoints(buffer, n, &consumed), std::min(n, expected.size()));
        EXPECT_EQ(contents(buffer), expected.substr(0, n));
        EXPECT_EQ(consumed, stream.position());
    }
    MemoryStream stream("UTF-8", bytes);
    OutputBuffer buffer(vxCHAR_CLASS, 4, 4, 16);
    // Chunks of 8 and then 16 units; the last round is the short one.
    EXPECT_EQ(stream.GetNCodePoints(buffer, &consumed), (expected.size() - 8) % 16);
    EXPECT_EQ(consumed, bytes.size());
    EXPECT_EQ(contents(buffer), expected);
    EXPECT_EQ(stream.getUTF16Position(), expected.size());
}

TEST(Decoding, AsksForDetectionOnlyWhereAsciiEnds) {
    using Starts = std::vector<unsigned long>;
    const auto detections = [](std::string_view bytes, unsigned long step) {
        MemoryStream stream("", bytes);
        std::u16string all, part(step, u'x');
        for (; part.size() == step; all += part)
            stream.GetNCodePoints(part, step, nullptr);
        EXPECT_EQ(all, decodedAtOnce("UTF-8", bytes));
        return stream.detections;
    };
    EXPECT_EQ(detections("abc", 8), Starts());
    EXPECT_EQ(detections("ab\xC3\xA9", 4), Starts{2});
    EXPECT_EQ(detections("ab\xC3\xA9", 1), Starts{0});
    EXPECT_EQ(detections("ab\0"sv, 3), Starts()) << "a NUL that ends a read is no sign of anything";
    EXPECT_EQ(detections("a\0b\0"sv, 4), Starts{1});
    EXPECT_EQ(detections("a\0b\0"sv, 1), Starts());
}

TEST(TcodnStream, OpensTheDetectedEncoding) {
    const auto nameOf = [](const char* detected) {
        MemoryStream stream("");
        stream.detected = detected;
        return stream.GetEncodingName();
    };
    EXPECT_EQ(nameOf("latin1"), "ISO-8859-1");
    EXPECT_EQ(nameOf(""), "UTF-8");
    EXPECT_EQ(fileio_tests::raisedBy([&] { nameOf("elvish"); }),
              "KESTRA:iofun:InvalidEncoding elvish");
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
