#include "fileio/host/text.h"

#include "fileio/host/memory.h"

#include <cstdint>

#include <unicode/uchar.h>
#include <unicode/ucnv.h>
#include <unicode/ustring.h>
#include <unicode/utf16.h>
#include <unicode/utf8.h>

bool qzu_isbreakablespace(char16_t unit) {
    constexpr char16_t figureSpace = 0x2007;
    constexpr char16_t noBreakSpace = 0x00A0;
    constexpr char16_t narrowNoBreakSpace = 0x202F;
    if (unit < 0x80) return unit == ' ' || (unit >= '\t' && unit <= '\r');
    return u_isUWhiteSpace(unit) && unit != noBreakSpace && unit != figureSpace &&
           unit != narrowNoBreakSpace;
}

// The narrow encoding is UTF-8; unpaired surrogates and malformed bytes become U+FFFD.
std::string vxTextToNarrow(const char16_t* text, std::size_t units) {
    std::string narrow;
    narrow.reserve(units);
    for (std::size_t i = 0; i < units;) {
        UChar32 character = 0;
        U16_NEXT_OR_FFFD(text, i, units, character);
        char bytes[U8_MAX_LENGTH];
        std::size_t length = 0;
        U8_APPEND_UNSAFE(bytes, length, character);
        narrow.append(bytes, length);
    }
    return narrow;
}

std::u16string vxTextFromNarrow(const char* text, std::size_t bytes) {
    if (bytes > INT32_MAX) vxMemoryRaiseExhausted();
    const auto length = static_cast<std::int32_t>(bytes);
    constexpr UChar32 replacement = 0xFFFD;
    std::u16string wide(bytes, u'\0');  // a character never takes more units than bytes
    std::int32_t units = 0;
    UErrorCode status = U_ZERO_ERROR;
    u_strFromUTF8WithSub(wide.data(), length, &units, text, length, replacement, nullptr, &status);
    wide.resize(static_cast<std::size_t>(units));
    return wide;
}

bool vxTextWidenAscii(const char* text, std::size_t count, char16_t* out) {
    unsigned seen = 0;
    for (std::size_t i = 0; i < count; ++i) {
        const auto byte = static_cast<unsigned char>(text[i]);
        seen |= byte;
        out[i] = byte;
    }
    return seen < 0x80;
}

std::string vxTextCanonicalEncodingName(const char* name) {
    for (const char* standard : {"MIME", "IANA"}) {
        UErrorCode status = U_ZERO_ERROR;
        const char* known = ucnv_getStandardName(name, standard, &status);
        if (U_SUCCESS(status) && known != nullptr) return known;
    }
    return name;
}
