#include "benchmarks/charsets.h"

#include "benchmarks/context.h"

#include <algorithm>
#include <stdexcept>

namespace bench {
namespace {

constexpr std::size_t blockSize = 65536;

}  // namespace

std::u16string textFor(const Charset& charset, std::size_t units) {
    Random random;
    std::u16string text;
    text.reserve(units);
    for (std::size_t i = 1; i <= units; ++i) {
        if (i % 60 == 0) {
            text += u'\n';
        } else if (i % 7 == 0) {
            text += u' ';
        } else {
            const bool isSpecial = random.integer(0, 99) < charset.percent;
            text += static_cast<char16_t>(isSpecial ? random.integer(charset.first, charset.last)
                                                    : random.integer(u'a', u'z'));
        }
    }
    return text;
}

IcuConverter::IcuConverter(const char* name) {
    UErrorCode status = U_ZERO_ERROR;
    converter = ucnv_open(name, &status);
    if (U_FAILURE(status)) throw std::runtime_error(std::string("no converter for ") + name);
}

IcuConverter::~IcuConverter() {
    ucnv_close(converter);
}

std::size_t IcuConverter::decode(const std::string& bytes, char16_t* out, std::size_t room) const {
    char16_t* const begin = out;
    const char* from = bytes.data();
    const char* const end = from + bytes.size();
    UErrorCode status = U_ZERO_ERROR;
    while (from != end && U_SUCCESS(status)) {
        const char* const blockEnd = std::min(from + blockSize, end);
        ucnv_toUnicode(converter, &out, begin + room, &from, blockEnd, nullptr, blockEnd == end,
                       &status);
    }
    if (U_FAILURE(status)) throw std::runtime_error(u_errorName(status));
    return static_cast<std::size_t>(out - begin);
}

std::size_t IcuConverter::encode(const std::u16string& text, char* out, std::size_t room) const {
    char* const begin = out;
    const char16_t* from = text.data();
    const char16_t* const end = from + text.size();
    UErrorCode status = U_ZERO_ERROR;
    while (from != end && U_SUCCESS(status)) {
        const char16_t* const blockEnd = std::min(from + blockSize / 2, end);
        ucnv_fromUnicode(converter, &out, begin + room, &from, blockEnd, nullptr, blockEnd == end,
                         &status);
    }
    if (U_FAILURE(status)) throw std::runtime_error(u_errorName(status));
    return static_cast<std::size_t>(out - begin);
}

std::string encoded(const Charset& charset, const std::u16string& text) {
    std::string bytes(3 * text.size(), '\0');
    bytes.resize(IcuConverter(charset.icuName).encode(text, bytes.data(), bytes.size()));
    return bytes;
}

}  // namespace bench
