#include "tests/text/memory_stream.h"

#include <set>

#include <gtest/gtest.h>
#include <unicode/utf16.h>

namespace Orvandeil::FileIO {
namespace {

using namespace std::string_literals;

struct Row {
    int line;
    const char* encoding;
    std::string bytes;
};

const Row wellFormed[] = {
    {__LINE__, "UTF-8", "a\xC3\xA9\xE3\x81\x82 \xF0\x9F\x98\x80z\xF0\x9F\x98\x81"},
    {__LINE__, "CESU-8", "a\xED\xA0\xBD\xED\xB8\x80z"},
    {__LINE__, "Shift_JIS", "ab\x82\xA0\x83\x41 \xB1z"},
    {__LINE__, "ISO-2022-JP", "a\x1B$B$\"$$\x1B(Bb\x1B$B0!\x1B(B"},
    {__LINE__, "ISO-8859-1", "caf\xE9 \x80\xFF"s},
    {__LINE__, "UTF-16",
     "\xFF\xFE"
     "a\0\x3D\xD8\0\xDE"
     "a\0b\0"s},
    {__LINE__, "UTF-16", "\xFE\xFF\0a\xD8\x3D\xDE\0\0b"s},
    {__LINE__, "UTF-16LE", "a\0\x3D\xD8\0\xDE\x42\x30"s},
    {__LINE__, "UTF-32", "\xFF\xFE\0\0\0\xF6\1\0z\0\0\0"s},
    {__LINE__, "GB18030", "a\x81\x30\x81\x30\x94\x39\xFC\x36z"},
    {__LINE__, "SCSU", "a\x0B\x01\x80\xE4z"},
    {__LINE__, "Big5-HKSCS", "a\x88\x62z"},  // two units in one character
};

const Row illFormed[] = {
    {__LINE__, "UTF-8",
     "\xE3\x81"
     "ab"},
    {__LINE__, "UTF-8", "\xE9\n"},
    {__LINE__, "UTF-8", "\xF0\x9F\x98\xF0\x9F\x98\x80\xFF\xC3"},
    {__LINE__, "UTF-8", "\xED\xA0\x80z\xC0\xAF\xF0\x9F\x98"},
    {__LINE__, "Shift_JIS", "\x81 a\x82"},
    {__LINE__, "ISO-2022-JP", "a\x1B$B$\nb\x1B%z"},
    {__LINE__, "GB18030",
     "\x81\x30\x81"
     "ab\xFF\x81"},
    {__LINE__, "EUC-JP", "\x8F\xA2 a\x8F\xB0"},
    {__LINE__, "UTF-16",
     "\xFF\xFE\x3D\xD8"
     "a\0\0\xDE"
     "b\0c"s},
    {__LINE__, "US-ASCII", "a\x80\xFFz"},
};

// ICU over the whole text, then pairs and lone surrogates to one U+001A.
std::u16string decodedAtOnce(const Row& row) {
    UErrorCode status = U_ZERO_ERROR;
    UConverter* converter = ucnv_open(row.encoding, &status);
    const auto size = static_cast<std::int32_t>(row.bytes.size());
    std::u16string units(row.bytes.size() * 2, u'\0');
    const auto count =
        ucnv_toUChars(converter, units.data(), 2 * size, row.bytes.data(), size, &status);
    ucnv_close(converter);
    EXPECT_TRUE(U_SUCCESS(status)) << "line " << row.line;
    units.resize(static_cast<std::size_t>(count));
    std::erase_if(units, [](char16_t unit) { return U16_IS_TRAIL(unit); });
    for (char16_t& unit : units) {
        if (U16_IS_LEAD(unit)) unit = u'\u001A';
    }
    return units;
}

std::u16string readInSteps(MemoryStream& stream, unsigned long step, std::size_t& consumed) {
    std::u16string all;
    std::u16string part;
    std::size_t bytes = 0;
    do {
        stream.GetNCodePoints(part, step, &bytes);
        all += part;
        consumed += bytes;
    } while (part.size() == step);
    return all;
}

void expectSameInAnySteps(const Row& row) {
    const std::u16string expected = decodedAtOnce(row);
    for (std::size_t boundary = 0; boundary <= row.bytes.size(); ++boundary) {
        for (unsigned long step = 1; step <= row.bytes.size() + 1; ++step) {
            MemoryStream stream(row.encoding, row.bytes);
            stream.boundary = boundary;
            std::size_t consumed = 0;
            EXPECT_EQ(readInSteps(stream, step, consumed), expected)
                << "line " << row.line << ", step " << step << ", boundary " << boundary;
            EXPECT_EQ(consumed, row.bytes.size()) << "line " << row.line << ", step " << step;
            EXPECT_EQ(stream.next, row.bytes.size()) << "line " << row.line;
            EXPECT_EQ(stream.getErrorCode(), 0) << "line " << row.line;
        }
    }
}

TEST(Decoding, DoesNotDependOnWhereTheTextIsCut) {
    for (const Row& row : wellFormed)
        expectSameInAnySteps(row);
    for (const Row& row : illFormed)
        expectSameInAnySteps(row);
}

TEST(Decoding, ReadsACharacterAgainAfterItWasGivenBack) {
    const std::set<std::string> stateless = {"UTF-8",      "CESU-8",   "Shift_JIS",
                                             "ISO-8859-1", "UTF-16LE", "GB18030"};
    for (const Row& row : wellFormed) {
        if (stateless.count(row.encoding) == 0) continue;
        MemoryStream stream(row.encoding, row.bytes);
        std::u16string text;
        char16_t unit = 0;
        std::size_t bytes = 0;
        while (stream.GetNCodePoints(&unit, 1, &bytes) == 1) {
            stream.Rewind(bytes);
            char16_t again = 0;
            EXPECT_EQ(stream.GetNCodePoints(&again, 1, nullptr), 1U) << "line " << row.line;
            EXPECT_EQ(again, unit) << "line " << row.line;
            text += again;
        }
        EXPECT_EQ(text, decodedAtOnce(row)) << "line " << row.line;
    }
}

TEST(Decoding, FillsBuffersAndTextsAlike) {
    Row row = {__LINE__, "UTF-8", {}};
    for (int i = 0; i < 60; ++i)
        row.bytes += "a\xC3\xA9\xE3\x81\x82 z";
    const std::u16string expected = decodedAtOnce(row);
    for (const unsigned long n : {0UL, 1UL, 70UL, 240UL, 1UL << 40}) {
        MemoryStream stream("UTF-8", row.bytes);
        OutputBuffer buffer(vxCHAR_CLASS, 4, 4, 16);
        std::size_t consumed = 99;
        EXPECT_EQ(stream.GetNCodePoints(buffer, n, &consumed), std::min(n, expected.size()));
        EXPECT_EQ(buffer.GetSize(), std::min(n, expected.size()));
        EXPECT_EQ(consumed, stream.next);
        MemoryStream again("UTF-8", row.bytes);
        std::u16string text = u"old";
        EXPECT_EQ(again.GetNCodePoints(text, n, &consumed), buffer.GetSize());
        EXPECT_EQ(text, expected.substr(0, n));
        EXPECT_EQ(consumed, stream.next);
    }
    MemoryStream stream("UTF-8", row.bytes);
    OutputBuffer buffer(vxCHAR_CLASS, 4, 4, 16);
    std::size_t consumed = 0;
    // Chunks of 8 and then 16 units; the last round is the short one.
    EXPECT_EQ(stream.GetNCodePoints(buffer, &consumed), (expected.size() - 8) % 16);
    EXPECT_EQ(consumed, row.bytes.size());
    std::u16string collected;
    buffer.ResetNext();
    while (const void* unit = buffer.GetNext())
        collected += *static_cast<const char16_t*>(unit);
    EXPECT_EQ(collected, expected);
}

TEST(Decoding, AsksForDetectionOnlyWhereAsciiEnds) {
    struct Case {
        int line;
        std::string bytes;
        unsigned long step;
        std::vector<unsigned long> detections;
    };
    const Case cases[] = {
        {__LINE__, "abc", 8, {}},
        {__LINE__, "ab\xC3\xA9", 4, {2}},
        {__LINE__, "ab\xC3\xA9", 1, {0}},
        {__LINE__, "ab\0"s, 3, {}},  // a NUL that ends a read is no sign of anything
        {__LINE__, "a\0b\0"s, 4, {1}},
        {__LINE__, "a\0b\0"s, 1, {}},
        {__LINE__, "", 4, {}},
    };
    for (const Case& row : cases) {
        MemoryStream stream("", row.bytes);
        std::size_t consumed = 0;
        const Row utf8 = {row.line, "UTF-8", row.bytes};
        EXPECT_EQ(readInSteps(stream, row.step, consumed), decodedAtOnce(utf8)) << row.line;
        EXPECT_EQ(stream.detections, row.detections) << row.line;
    }
    MemoryStream undecided("", "\x80z");
    undecided.detected = "";
    EXPECT_EQ(undecided.GetEncodingName(), "UTF-8");
}

TEST(Decoding, ReadsWordsUpToTheBlankBehindThem) {
    struct Case {
        int line;
        const char* bytes;
        long width;
        std::u16string word;
        const char* rest;
    };
    const Case cases[] = {
        {__LINE__, "  abcdef", 3, u"abc", "def"},
        {__LINE__, "ab cd", 3, u"ab", " cd"},
        {__LINE__, "\n\tab\ncd", 9, u"ab", "\ncd"},
        {__LINE__,
         "a\xE3\x80\x80"
         "b",
         9, u"a",
         "\xE3\x80\x80"
         "b"},  // the ideographic blank goes back whole
        {__LINE__, "a\xC2\xA0z", -1, u"a\u00A0z", ""},
        {__LINE__, "\xF0\x9F\x98\x80 z", -1, u"\u001A", " z"},
        {__LINE__, "  ", -1, u"", ""},
        {__LINE__, " ab", 0, u"", " ab"},
    };
    for (const Case& row : cases) {
        MemoryStream stream("UTF-8", row.bytes);
        OutputBuffer buffer(vxCHAR_CLASS, 0, 0, 0);
        EXPECT_EQ(stream.GetString(buffer, row.width, row.width < 0), row.word.size()) << row.line;
        std::u16string word;
        while (const void* unit = buffer.GetNext())
            word += *static_cast<const char16_t*>(unit);
        EXPECT_EQ(word, row.word) << "line " << row.line;
        EXPECT_EQ(stream.input.substr(stream.next), row.rest) << "line " << row.line;
    }
    MemoryStream stream("UTF-8", " \r\n\xE2\x80\x83\xC3\xA9z");
    stream.SkipWhiteSpace();
    EXPECT_EQ(stream.next, 6U);
    stream.input = " \n";
    stream.next = 0;
    stream.SkipWhiteSpace();
    EXPECT_TRUE(stream.EndOfData());
}

}  // namespace
}  // namespace Orvandeil::FileIO
