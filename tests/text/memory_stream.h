#pragma once

#include "fileio/text/input_string_stream.h"

#include <algorithm>
#include <string>
#include <string_view>
#include <vector>

#include <unicode/utf16.h>

namespace Orvandeil::FileIO {

inline const char* const statelessEncodings[] = {"UTF-8",    "CESU-8",    "Shift_JIS",  "UTF-16LE",
                                                 "UTF-16BE", "GB18030",   "ISO-8859-1", "US-ASCII",
                                                 "EUC-JP",   "Big5-HKSCS"};

// ICU over the whole text, by one call: its string class asks again and again of a converter that
// fails on some texts (BOCU-1), and for ever.
inline std::u16string unitsOf(const char* encoding, std::string_view bytes) {
    UErrorCode status = U_ZERO_ERROR;
    UConverter* const converter = ucnv_open(encoding, &status);
    std::u16string units(8 * bytes.size() + 64, u'\0');
    char16_t* end = units.data();
    const char* next = bytes.data();
    ucnv_toUnicode(converter, &end, end + units.size(), &next, next + bytes.size(), nullptr, true,
                   &status);
    ucnv_close(converter);
    units.resize(static_cast<std::size_t>(end - units.data()));
    return units;
}

// The same, then pairs and lone surrogates to one U+001A.
inline std::u16string decodedAtOnce(const char* encoding, std::string_view bytes) {
    std::u16string units = unitsOf(encoding, bytes);
    std::erase_if(units, [](char16_t unit) { return U16_IS_TRAIL(unit); });
    const auto isLead = [](char16_t unit) { return U16_IS_LEAD(unit); };
    std::replace_if(units.begin(), units.end(), isLead, u'\x1A');
    return units;
}

// Reads a text that the caller keeps, in one read never across `boundary`, and collects what is
// written up to a limit.
struct MemoryStream : inputStringStream {
    explicit MemoryStream(const std::string& encoding, std::string_view bytes = "")
        : inputStringStream(bytes.data(), std::ssize(bytes), encoding) {}

    using TcodnStream::CheckStatus;

    unsigned long position() {
        long bytes = -1;
        getPosition(bytes);
        return static_cast<unsigned long>(bytes);
    }
    unsigned long GetNElements(unsigned long count, char* buffer, unsigned long size) override {
        if (position() < boundary) count = std::min(count, boundary - position());
        return inputStringStream::GetNElements(count, buffer, size);
    }
    unsigned long PutNElements(unsigned long count, const void* buffer,
                               unsigned long size) override {
        ++writes;
        count = std::min(count, (outputLimit - output.size()) / size);
        output.append(static_cast<const char*>(buffer), count * size);
        return count;
    }
    std::string DetectCharset(unsigned long startOffset) const override {
        detections.push_back(startOffset);
        return detected;
    }

    unsigned long boundary = 0;
    std::string output;
    std::size_t outputLimit = std::string::npos;
    int writes = 0;
    std::string detected = "UTF-8";
    mutable std::vector<unsigned long> detections;
};

}  // namespace Orvandeil::FileIO
