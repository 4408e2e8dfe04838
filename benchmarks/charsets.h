#pragma once

#include <cstddef>
#include <string>

#include <unicode/ucnv.h>

// Text in the encodings of the decode and encode jobs, and what ICU does with it.
namespace bench {

struct Charset {
    const char* name;  // of the job, behind "decode-" and "encode-"
    const char* icuName;
    const char* iconvName;
    // The characters that the text is made of, as ranges; words of them, in lines.
    char16_t first;
    char16_t last;
    int percent;  // of letters from that range; the others are ASCII
};

inline constexpr Charset charsets[] = {
    {"ascii", "UTF-8", "UTF-8", u'a', u'z', 0},
    {"accents", "UTF-8", "UTF-8", u'\u00E0', u'\u00FF', 15},
    {"cjk", "UTF-8", "UTF-8", u'\u4E00', u'\u9FA5', 90},
    {"latin1", "ISO-8859-1", "ISO-8859-1", u'\u00E0', u'\u00FF', 15},
    {"sjis", "Shift_JIS", "SHIFT_JIS", u'\u3042', u'\u3093', 80},
    {"utf16", "UTF-16LE", "UTF-16LE", u'\u0400', u'\u044F', 50},
};

std::u16string textFor(const Charset& charset, std::size_t units);

class IcuConverter {
public:
    explicit IcuConverter(const char* name);
    ~IcuConverter();
    IcuConverter(const IcuConverter&) = delete;
    IcuConverter& operator=(const IcuConverter&) = delete;

    // In blocks of 64 KB. Return the units or bytes written.
    std::size_t decode(const std::string& bytes, char16_t* out, std::size_t room) const;
    std::size_t encode(const std::u16string& text, char* out, std::size_t room) const;

private:
    UConverter* converter;
};

std::string encoded(const Charset& charset, const std::u16string& text);

}  // namespace bench
