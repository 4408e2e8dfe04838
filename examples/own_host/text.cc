#include "fileio/host/text.h"

#include "fileio/host/data_sizes.h"

#include <algorithm>
#include <cstdlib>
#include <iterator>
#include <string>
#include <string_view>

bool qzu_isbreakablespace(char16_t unit) {
    return unit == u' ' || (unit >= u'\t' && unit <= u'\r');
}

// Narrow text is Latin-1.
std::string vxTextToNarrow(const char16_t* text, std::size_t units) {
    std::string narrow(units, '?');
    std::transform(text, text + units, narrow.begin(),
                   [](char16_t unit) { return unit < 0x100 ? static_cast<char>(unit) : '?'; });
    return narrow;
}

std::u16string vxTextFromNarrow(const char* text, std::size_t bytes) {
    const auto* first = reinterpret_cast<const unsigned char*>(text);
    return std::u16string(first, first + bytes);
}

bool vxTextWidenAscii(const char* text, std::size_t count, char16_t* out) {
    const auto isAscii = [](char byte) { return static_cast<unsigned char>(byte) < 0x80; };
    if (!std::all_of(text, text + count, isAscii)) return false;
    std::copy_n(text, count, out);
    return true;
}

std::string vxTextCanonicalEncodingName(const char* name) {
    return name;
}

bool vxTextEncodingIsSupported(const char* canonicalName) {
    constexpr std::string_view supported[] = {"US-ASCII", "ISO-8859-1", "UTF-8", "UTF-16"};
    return std::find(std::begin(supported), std::end(supported), canonicalName) !=
           std::end(supported);
}

// A byte-order mark is all that this host goes by.
std::string vxTextDetectCharset(const char* bytes, std::size_t count, vxConsoleSink&,
                                const std::u16string&) {
    const std::string_view start(bytes, std::min<std::size_t>(count, 2));
    return start == "\xFF\xFE" || start == "\xFE\xFF" ? "UTF-16" : "UTF-8";
}

double vxTextToDouble(const char* text, std::size_t count, std::size_t* consumed) {
    // The library keeps the numeric locale at "C".
    const std::string number(text, count);
    char* end;
    const double value = std::strtod(number.c_str(), &end);
    *consumed = static_cast<std::size_t>(end - number.c_str());
    return value;
}

namespace {

constexpr const char* formatNames[] = {"little", "big"};
constexpr int formatCount = 3;  // the last one is no format
constexpr int elementBytes[] = {0, 1, 2, 1, 2, 4, 8, 1, 2, 4, 8, 4, 8};

}  // namespace

int vxDataSizeNative() {
    return 0;
}

int vxDataSizeCount() {
    return formatCount;
}

const char* vxDataSizeName(int index) {
    return index == 0 || index == 1 ? formatNames[index] : nullptr;
}

int vxDataSizeEndian(int index) {
    return index == 1 ? 1 : 0;
}

int vxDataSizeConverted(int, int type) {
    return type >= 1 && type <= 12 ? elementBytes[type] : 0;
}
