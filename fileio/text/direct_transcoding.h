#pragma once

#include "fileio/text/byte_table.h"

#include <cstddef>

#include <unicode/ucnv.h>

// Transcoding without a converter, for text in encodings without state. All of it handles a prefix
// and tells how far it came: ill-formed text, characters beyond the Basic Multilingual Plane and
// characters that are not complete are left to the converter.
namespace Orvandeil::FileIO::detail {

enum class DirectForm : unsigned char { None, Ascii, Latin1, Utf8, Utf16LE, Utf16BE, Table };

// Whether bytes below 0x80 stand for themselves, and appear in no other character.
inline bool isAsciiTransparent(DirectForm form) {
    return form == DirectForm::Ascii || form == DirectForm::Latin1 || form == DirectForm::Utf8;
}

DirectForm directFormOf(const UConverter* converter);

// Elements of the source and of the target.
struct Progress {
    std::size_t taken;
    std::size_t made;
};

// `table` serves DirectForm::Table only.
Progress decodeDirectly(DirectForm form, const ByteTable* table, const char* bytes,
                        std::size_t count, char16_t* out, std::size_t room);

// Takes at most `units`, and needs roomToEncode bytes for them.
constexpr std::size_t roomToEncode(std::size_t units) {
    return 3 * units + 1;
}
Progress encodeDirectly(DirectForm form, const ByteTable* table, const char16_t* text,
                        std::size_t units, char* out);

// Widens the leading bytes below 0x80, and returns their number. There must be room for all bytes.
std::size_t widenAscii(const char* bytes, std::size_t count, char16_t* out);

// The number of leading bytes from 0x01 to 0x7F.
std::size_t asciiWithoutNul(const char* bytes, std::size_t count);

// Decodes a well-formed character of two or three bytes at `bytes`, which lies before `end`.
// Returns its length, or 0.
inline std::size_t decodeUtf8Character(const char* bytes, const char* end, char16_t& unit) {
    const auto byteAt = [bytes](int i) -> unsigned { return static_cast<unsigned char>(bytes[i]); };
    const auto isTrail = [](unsigned byte) { return (byte & 0xC0) == 0x80; };
    const unsigned lead = byteAt(0);
    if (lead >= 0xE0) {
        if (lead >= 0xF0 || end - bytes < 3 || !isTrail(byteAt(1)) || !isTrail(byteAt(2))) return 0;
        const unsigned point = (lead & 0xF) << 12 | (byteAt(1) & 0x3F) << 6 | (byteAt(2) & 0x3F);
        if (point < 0x800 || (point & 0xF800) == 0xD800) return 0;
        unit = static_cast<char16_t>(point);
        return 3;
    }
    if (lead < 0xC2 || end - bytes < 2 || !isTrail(byteAt(1))) return 0;
    unit = static_cast<char16_t>((lead & 0x1F) << 6 | (byteAt(1) & 0x3F));
    return 2;
}

}  // namespace Orvandeil::FileIO::detail
