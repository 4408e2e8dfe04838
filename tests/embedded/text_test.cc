#include "fileio/host/text.h"

#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <string>
#include <string_view>

#include <gtest/gtest.h>
#include <unicode/uchar.h>
#include <unicode/unistr.h>

namespace {

std::u16string utf16(const icu::UnicodeString& text) {
    return {text.getBuffer(), static_cast<std::size_t>(text.length())};
}

std::u16string widened(std::string_view bytes) {
    return vxTextFromNarrow(bytes.data(), bytes.size());
}

TEST(HostText, BreakableSpaces) {
    for (char32_t unit = 0; unit <= 0xFFFF; ++unit) {
        const bool isNoBreak = unit == 0xA0 || unit == 0x2007 || unit == 0x202F;
        EXPECT_EQ(qzu_isbreakablespace(static_cast<char16_t>(unit)),
                  u_isUWhiteSpace(static_cast<UChar32>(unit)) && !isNoBreak)
            << std::uint32_t{unit};
    }
}

TEST(HostText, EveryCharacterReturns) {
    for (UChar32 character = 0; character <= 0x10FFFF; ++character) {
        const icu::UnicodeString text(character);
        std::string bytes;
        text.toUTF8String(bytes);
        const std::u16string wide = utf16(text);
        ASSERT_EQ(vxTextToNarrow(wide.data(), wide.size()), bytes) << character;
        ASSERT_TRUE(widened(bytes) == (U_IS_SURROGATE(character) ? u"\uFFFD" : wide)) << character;
    }
}

// Every text of four bytes at the borders of what each place of a character allows.
TEST(HostText, MalformedBytesAreSubstituted) {
    const std::string_view borders("\0a\x80\x8F\x90\x9F\xA0\xBF\xC1\xC2\xE0\xED\xF0\xF4\xF5\xFF",
                                   16);
    for (std::size_t code = 0; code < 16 * 16 * 16 * 16; ++code) {
        const char bytes[] = {borders[code >> 12], borders[code >> 8 & 15], borders[code >> 4 & 15],
                              borders[code & 15]};
        const auto text = icu::UnicodeString::fromUTF8(icu::StringPiece(bytes, sizeof bytes));
        ASSERT_TRUE(widened({bytes, sizeof bytes}) == utf16(text)) << std::hex << code;
    }
    EXPECT_TRUE(widened("").empty());
}

TEST(HostText, WidensAsciiOnly) {
    for (int byte = 0; byte < 256; ++byte) {
        const char text[] = {'a', static_cast<char>(byte), 'b'};
        char16_t wide[3] = {};
        EXPECT_EQ(vxTextWidenAscii(text, 3, wide), byte < 0x80);
        EXPECT_TRUE(byte >= 0x80 || wide[1] == byte) << byte;
    }
}

TEST(HostText, CanonicalEncodingNames) {
    const char* const rows[][2] = {
        {"utf8", "UTF-8"},    {"latin1", "ISO-8859-1"}, {"ibm-5348_P100-1997", "windows-1252"},
        {"UTF-16", "UTF-16"}, {"no such", "no such"},   {"ibm-943_P15A-2003", "Shift_JIS"}};
    for (const auto& row : rows)
        EXPECT_EQ(vxTextCanonicalEncodingName(row[0]), row[1]);
}

std::string described(double value, std::size_t consumed) {
    char text[40];
    std::snprintf(text, sizeof text, "%a in %zu", value, consumed);
    return std::isnan(value) ? "nan in " + std::to_string(consumed) : text;
}

std::string readNumber(const std::string& text, std::size_t count) {
    std::size_t consumed = 99;
    const double value = vxTextToDouble(text.data(), count, &consumed);
    return described(value, consumed);
}

std::string readByTheCLibrary(const std::string& text) {
    char* end = nullptr;
    const double value = std::strtod(text.c_str(), &end);
    return described(value, static_cast<std::size_t>(end - text.c_str()));
}

// Every text of six characters, and the beginnings of some longer ones.
TEST(NumberSyntax, IsThatOfTheCLibrary) {
    for (unsigned code = 0; code < 7 * 7 * 7 * 7 * 7 * 7; ++code) {
        std::string text;
        for (unsigned rest = code; text.size() < 6; rest /= 7)
            text += "+-.05e,"[rest % 7];
        ASSERT_EQ(readNumber(text, 6), readByTheCLibrary(text)) << text;
    }
    for (const std::string text :
         {"-INFINITYx", "+Infinity", "NaN", "1e309", "-1e99999999999999999999", "1E-400", "0.1x",
          "1e-99999999999999999999", "1234567890e300", "0.00000000001e-320", "4.9e-324"}) {
        for (std::size_t count = 0; count <= text.size(); ++count)
            EXPECT_EQ(readNumber(text, count), readByTheCLibrary(text.substr(0, count))) << text;
    }
}

TEST(NumberSyntax, LeavesOutWhatOnlyTheCLibraryKnows) {
    EXPECT_EQ(readNumber(" 5", 2), described(0, 0));
    EXPECT_EQ(readNumber("0x10", 4), described(0, 1));
    EXPECT_EQ(readNumber("nan(1)", 6), described(NAN, 3));
}

}  // namespace
