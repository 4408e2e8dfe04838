#include "fileio/host/text.h"

#include "fileio/host/data_sizes.h"

#include <set>

#include <gtest/gtest.h>

namespace {

TEST(HostText, BreakableSpaces) {
    const std::set<unsigned> blanks = {
        0x09,   0x0A,   0x0B,   0x0C,   0x0D,   0x20,   0x85,   0x1680, 0x2000, 0x2001, 0x2002,
        0x2003, 0x2004, 0x2005, 0x2006, 0x2008, 0x2009, 0x200A, 0x2028, 0x2029, 0x205F, 0x3000};
    for (unsigned unit = 0; unit <= 0xFFFF; ++unit) {
        EXPECT_EQ(qzu_isbreakablespace(static_cast<char16_t>(unit)), blanks.contains(unit)) << unit;
    }
}

std::u16string utf16(char32_t character) {
    if (character < 0x10000) return std::u16string(1, static_cast<char16_t>(character));
    const char32_t rest = character - 0x10000;
    return {static_cast<char16_t>(0xD800 + (rest >> 10)),
            static_cast<char16_t>(0xDC00 + (rest & 0x3FF))};
}

TEST(HostText, EveryCharacterReturns) {
    for (char32_t character = 0; character <= 0x10FFFF; ++character) {
        const std::u16string wide = utf16(character);
        const bool surrogate = character >= 0xD800 && character <= 0xDFFF;
        const std::string narrow = vxTextToNarrow(wide.data(), wide.size());
        const std::u16string again = vxTextFromNarrow(narrow.data(), narrow.size());
        ASSERT_TRUE(again == (surrogate ? u"\uFFFD" : wide)) << std::uint32_t{character};
    }
}

TEST(HostText, MalformedBytesAreSubstituted) {
    const struct {
        int line;
        std::string bytes;
        std::u16string text;
    } rows[] = {
        {__LINE__, "", u""},
        {__LINE__, "a\x80z", u"a\uFFFDz"},
        {__LINE__, "\xC3", u"\uFFFD"},
        {__LINE__, "\xE2\x82z", u"\uFFFDz"},
        {__LINE__, "\xC0\x80", u"\uFFFD\uFFFD"},
        {__LINE__, "\xFF\xF4\x90", u"\uFFFD\uFFFD\uFFFD"},
        {__LINE__, std::string("a\0b", 3), std::u16string(u"a\0b", 3)},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.line);
        EXPECT_TRUE(vxTextFromNarrow(row.bytes.data(), row.bytes.size()) == row.text);
    }
}

TEST(HostText, WidensAsciiOnly) {
    for (int byte = 0; byte < 256; ++byte) {
        const char text[] = {'a', static_cast<char>(byte), 'b'};
        char16_t wide[3];
        EXPECT_EQ(vxTextWidenAscii(text, 3, wide), byte < 0x80);
        if (byte < 0x80) {
            EXPECT_EQ(wide[1], byte);
        }
    }
}

TEST(HostText, CanonicalEncodingNames) {
    const char* const rows[][2] = {
        {"UTF-8", "UTF-8"},           {"utf8", "UTF-8"},
        {"ISO-8859-1", "ISO-8859-1"}, {"latin1", "ISO-8859-1"},
        {"US-ASCII", "US-ASCII"},     {"ibm-5348_P100-1997", "windows-1252"},
        {"UTF-16", "UTF-16"},         {"ibm-943_P15A-2003", "Shift_JIS"},
        {"no such", "no such"},
    };
    for (const auto& row : rows)
        EXPECT_EQ(vxTextCanonicalEncodingName(row[0]), row[1]);
}

TEST(HostDataSizes, Formats) {
    const struct {
        const char* name;
        int byteOrder;
    } formats[] = {{"little-endian", 0},  {"big-endian", 1}, {nullptr, 0},
                   {nullptr, 0},          {nullptr, 0},      {"little-endian.l64", 0},
                   {"big-endian.l64", 1}, {nullptr, 0}};
    ASSERT_EQ(vxDataSizeCount(), 8);
    EXPECT_EQ(vxDataSizeNative(), 0);
    for (int index = 0; index < 8; ++index) {
        EXPECT_STREQ(vxDataSizeName(index), formats[index].name);
        EXPECT_EQ(vxDataSizeEndian(index), formats[index].byteOrder);
    }
    for (const int outside : {-1, 8}) {
        EXPECT_EQ(vxDataSizeName(outside), nullptr);
        EXPECT_EQ(vxDataSizeConverted(outside, 12), 0);
    }
    const int bytes[] = {0, 1, 2, 1, 2, 4, 8, 1, 2, 4, 8, 4, 8, 0};
    for (int type = 0; type <= 13; ++type)
        EXPECT_EQ(vxDataSizeConverted(1, type), bytes[type]);
}

}  // namespace
