#include "fileio/host/exception.h"
#include "tests/text/memory_stream.h"

#include <clocale>
#include <random>

#include <gtest/gtest.h>

namespace Orvandeil::FileIO {
namespace {

using namespace std::string_literals;

const char* const encodings[] = {"UTF-8",      "Shift_JIS", "UTF-16LE", "UTF-16BE",
                                 "UTF-32",     "CESU-8",    "GB18030",  "ISO-2022-JP",
                                 "ISO-8859-1", "US-ASCII",  "UTF-7",    "EUC-JP"};

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
    for (int round = 0; round < 1210; ++round) {
        const char* encoding = encodings[static_cast<std::size_t>(round) % std::size(encodings)];
        // The last rounds take texts of which some grow the scratch many times over.
        std::u16string text(random() % (round < 1200 ? 90 : 100000), u'\0');
        for (char16_t& unit : text)
            unit = alphabet[random() % alphabet.size()];
        MemoryStream stream(encoding);
        int calls = 0;
        for (std::size_t at = 0; at < text.size(); ++calls) {
            const std::size_t n = 1 + random() % (text.size() / 3 + 1);
            stream.PutString(std::u16string_view(text).substr(at, n));
            at += n;
        }
        EXPECT_EQ(stream.output, encodedAtOnce(encoding, text)) << encoding << " " << round;
        EXPECT_EQ(stream.writes, calls);
        EXPECT_EQ(stream.getErrorCode(), 0);
    }
}

TEST(Encoding, CountsByEncoding) {
    struct Case {
        int line;
        const char* encoding;
        std::u16string text;
        std::size_t limit;  // bytes that the stream takes
        unsigned long result;
    };
    constexpr std::size_t all = std::string::npos;
    const Case cases[] = {
        {__LINE__, "ISO-8859-1", u"abc", all, 3},
        {__LINE__, "ISO-8859-1", u"abc", 2, 2},
        {__LINE__, "ISO-8859-1", u"\U0001F600", all, 1},
        {__LINE__, "ISO-8859-1", u"\xD83D", all, 0},
        {__LINE__, "UTF-32", u"abc", all, 4},  // the mark is counted
        {__LINE__, "UTF-32BE", u"abc", all, 3},
        {__LINE__, "UTF-32BE", u"abc", 9, 2},
        {__LINE__, "UTF-16BE", u"a\U0001F600", all, 3},
        {__LINE__, "UTF-8", u"ab\u3042", all, 3},
        {__LINE__, "UTF-8", u"ab\u3042", 4, 0},
        {__LINE__, "UTF-8", u"\xD83D", all, 1},
        {__LINE__, "UTF-16", u"abc", all, 3},
        {__LINE__, "UTF-16", u"abc", 5, 2},
        {__LINE__, "", u"", all, 0},
    };
    for (const Case& row : cases) {
        MemoryStream stream(row.encoding);
        stream.outputLimit = row.limit;
        EXPECT_EQ(stream.PutString(row.text), row.result) << "line " << row.line;
    }
}

TEST(Encoding, Utf16GoesOutAsItIsWithoutAMark) {
    for (const char* name : {"", "utf16", "unicode", "ucs-2"}) {
        MemoryStream stream(name);
        stream.detected = "UTF-16";
        EXPECT_EQ(stream.PutString(nullptr, 4), 0U);
        EXPECT_TRUE(stream.detections.empty());
        EXPECT_EQ(stream.PutString(u"a\xDE00"), 2U);
        EXPECT_EQ(stream.PutASCIIString("b", 1), 1);
        EXPECT_EQ(stream.output,
                  "a\0\0\xDE"
                  "b\0"s);
        EXPECT_EQ(stream.detections.size(), *name ? 0U : 1U);
    }
}

TEST(Encoding, AsciiTextIsAsciiOnly) {
    MemoryStream stream("ISO-8859-1");
    EXPECT_EQ(stream.PutASCIIString("caf\xE9", 4), 0);
    EXPECT_EQ(stream.PutASCIIString("caf\xE9", 3), 3);
    EXPECT_EQ(stream.PutASCIIString("x", -1), 0);
    EXPECT_EQ(stream.output, "caf");
    EXPECT_EQ(stream.writes, 1);
}

TEST(TcodnStream, KeepsTheLastConverterFailure) {
    const struct {
        UErrorCode status;
        int code;
    } cases[] = {{U_INVALID_CHAR_FOUND, -37},
                 {U_TRUNCATED_CHAR_FOUND, -38},
                 {U_ILLEGAL_CHAR_FOUND, -39},
                 {U_INVALID_TABLE_FORMAT, -40},
                 {U_BUFFER_OVERFLOW_ERROR, -41},
                 {U_MEMORY_ALLOCATION_ERROR, -42},
                 {U_ZERO_ERROR, -42},
                 {U_AMBIGUOUS_ALIAS_WARNING, -42}};
    MemoryStream stream("UTF-8");
    for (const auto& row : cases) {
        stream.CheckStatus(row.status);
        EXPECT_EQ(stream.getErrorCode(), row.code);
    }
}

TEST(TcodnStream, RefusesUnknownEncodings) {
    const auto identifierOf = [](const auto& action) -> std::string {
        try {
            action();
        } catch (const foundation::core::except::IMsgIDException& error) {
            return error.GetID() + ' ' + error.GetBaseMsgIDObj().GetArguments().at(0);
        }
        return "none";
    };
    EXPECT_EQ(identifierOf([] { MemoryStream stream("klingon"); }),
              "KESTRA:iofun:InvalidEncoding klingon");
    MemoryStream stream("");
    stream.detected = "elvish";
    EXPECT_EQ(identifierOf([&] { stream.PutString(u"a"); }), "KESTRA:iofun:InvalidEncoding elvish");
    stream.detected = "latin1";
    EXPECT_EQ(stream.GetEncodingName(), "ISO-8859-1");
}

TEST(TcodnStream, MakesThePointADecimalPoint) {
    if (!std::setlocale(LC_NUMERIC, "C.UTF-8")) GTEST_SKIP() << "no second locale here";
    MemoryStream stream("");
    EXPECT_STREQ(std::setlocale(LC_NUMERIC, nullptr), "C");
}

}  // namespace
}  // namespace Orvandeil::FileIO
