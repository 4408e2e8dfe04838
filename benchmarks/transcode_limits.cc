#include "benchmarks/transcode_limits.h"

#include "benchmarks/charsets.h"
#include "benchmarks/limit_loops.h"

#include <array>
#include <cstdint>
#include <cstring>
#include <emmintrin.h>
#include <memory>

namespace bench {
namespace {

// Widens what is ASCII of the next sixteen bytes; out has room for all of them. Returns how many.
int widenAscii(const char* from, char16_t* out) {
    const __m128i bytes = _mm_loadu_si128(reinterpret_cast<const __m128i*>(from));
    const __m128i zero = _mm_setzero_si128();
    _mm_storeu_si128(reinterpret_cast<__m128i*>(out), _mm_unpacklo_epi8(bytes, zero));
    _mm_storeu_si128(reinterpret_cast<__m128i*>(out) + 1, _mm_unpackhi_epi8(bytes, zero));
    const int others = _mm_movemask_epi8(bytes);
    return others == 0 ? 16 : __builtin_ctz(static_cast<unsigned>(others));
}

// Narrows what is ASCII of the next eight units.
int narrowAscii(const char16_t* from, char* out) {
    const __m128i units = _mm_loadu_si128(reinterpret_cast<const __m128i*>(from));
    const __m128i high = _mm_and_si128(units, _mm_set1_epi16(static_cast<short>(0xFF80)));
    const __m128i isAscii = _mm_cmpeq_epi16(high, _mm_setzero_si128());
    _mm_storel_epi64(reinterpret_cast<__m128i*>(out), _mm_packus_epi16(units, units));
    const int others = ~_mm_movemask_epi8(isAscii) & 0xFFFF;
    return others == 0 ? 8 : __builtin_ctz(static_cast<unsigned>(others)) / 2;
}

// One character of UTF-8.
const char* decodeCharacter(const char* from, char16_t* out) {
    const auto byte = [from](int i) { return static_cast<unsigned>(from[i]) & 0x3F; };
    const auto lead = static_cast<unsigned char>(*from);
    if (lead < 0x80) {
        *out = lead;
        return from + 1;
    }
    if (lead < 0xE0) {
        *out = static_cast<char16_t>((lead & 0x1Fu) << 6 | byte(1));
        return from + 2;
    }
    *out = static_cast<char16_t>((lead & 0xFu) << 12 | byte(1) << 6 | byte(2));
    return from + 3;
}

char* encodeCharacter(char16_t unit, char* out) {
    if (unit < 0x80) {
        *out++ = static_cast<char>(unit);
    } else if (unit < 0x800) {
        *out++ = static_cast<char>(0xC0 | unit >> 6);
        *out++ = static_cast<char>(0x80 | (unit & 0x3F));
    } else {
        *out++ = static_cast<char>(0xE0 | unit >> 12);
        *out++ = static_cast<char>(0x80 | (unit >> 6 & 0x3F));
        *out++ = static_cast<char>(0x80 | (unit & 0x3F));
    }
    return out;
}

std::size_t decodeUtf8(const std::string& bytes, char16_t* out) {
    char16_t* const begin = out;
    const char* from = bytes.data();
    const char* const end = from + bytes.size();
    while (from != end) {
        if (end - from >= 16 && *from >= 0) {
            const int run = widenAscii(from, out);
            from += run;
            out += run;
        }
        while (from != end && (*from < 0 || end - from < 16))
            from = decodeCharacter(from, out++);
    }
    return static_cast<std::size_t>(out - begin);
}

std::size_t encodeUtf8(const std::u16string& text, char* out) {
    char* const begin = out;
    const char16_t* from = text.data();
    const char16_t* const end = from + text.size();
    while (from != end) {
        if (end - from >= 8 && *from < 0x80) {
            const int run = narrowAscii(from, out);
            from += run;
            out += run;
        }
        while (from != end && (*from >= 0x80 || end - from < 8))
            out = encodeCharacter(*from++, out);
    }
    return static_cast<std::size_t>(out - begin);
}

// Shift_JIS both ways.
struct JapaneseTables {
    std::array<char16_t, 65536> units;       // of two bytes, the first one high
    std::array<std::uint16_t, 65536> bytes;  // of a unit
};

std::unique_ptr<JapaneseTables> makeJapaneseTables() {
    auto tables = std::make_unique<JapaneseTables>();
    const IcuConverter converter("Shift_JIS");
    for (unsigned code = 0x8140; code < 0xFFFF; ++code) {
        const std::string pair = {static_cast<char>(code >> 8), static_cast<char>(code & 0xFF)};
        std::array<char16_t, 4> decoded = {};
        converter.decode(pair, decoded.data(), decoded.size());
        tables->units[code] = decoded[0];
        tables->bytes[decoded[0]] = static_cast<std::uint16_t>(code);
    }
    return tables;
}

const JapaneseTables& japanese() {
    static const std::unique_ptr<JapaneseTables> tables = makeJapaneseTables();
    return *tables;
}

std::size_t decodeJapanese(const std::string& bytes, char16_t* out) {
    const JapaneseTables& tables = japanese();
    char16_t* const begin = out;
    const char* from = bytes.data();
    const char* const end = from + bytes.size();
    while (from != end) {
        const auto lead = static_cast<unsigned char>(*from++);
        if (lead < 0x80) {
            *out++ = lead;
        } else {
            *out++ = tables.units[lead * 256u + static_cast<unsigned char>(*from++)];
        }
    }
    return static_cast<std::size_t>(out - begin);
}

std::size_t encodeJapanese(const std::u16string& text, char* out) {
    const JapaneseTables& tables = japanese();
    char* const begin = out;
    for (const char16_t unit : text) {
        const std::uint16_t code = unit < 0x80 ? unit : tables.bytes[unit];
        if (code >= 0x100) *out++ = static_cast<char>(code >> 8);
        *out++ = static_cast<char>(code);
    }
    return static_cast<std::size_t>(out - begin);
}

}  // namespace

std::size_t limitDecode(std::string_view encoding, const std::string& bytes, char16_t* out) {
    if (encoding == "UTF-8") return decodeUtf8(bytes, out);
    if (encoding == "Shift_JIS") return decodeJapanese(bytes, out);
    if (encoding == "ISO-8859-1") {
        widen(bytes.data(), bytes.size(), out);
        return bytes.size();
    }
    std::memcpy(out, bytes.data(), bytes.size());
    return bytes.size() / sizeof(char16_t);
}

std::size_t limitEncode(std::string_view encoding, const std::u16string& text, char* out) {
    if (encoding == "UTF-8") return encodeUtf8(text, out);
    if (encoding == "Shift_JIS") return encodeJapanese(text, out);
    if (encoding == "ISO-8859-1") {
        narrow(text.data(), text.size(), out);
        return text.size();
    }
    std::memcpy(out, text.data(), text.size() * sizeof(char16_t));
    return text.size() * sizeof(char16_t);
}

}  // namespace bench
