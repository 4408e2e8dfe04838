#include "fileio/text/units_ahead.h"

namespace Orvandeil::FileIO::detail {

DirectForm UnitsAhead::form() const {
    if (stream.midCharacter || (!file && !text)) return DirectForm::None;
    return stream.asciiSoFar ? DirectForm::Ascii : stream.directForm;
}

std::string_view UnitsAhead::bytes() const {
    if (file) return bytesReadAhead(file->file);
    return text ? std::string_view(text->current, text->end) : std::string_view();
}

unsigned long UnitsAhead::takeUnits(char16_t* out, unsigned long n, std::size_t& consumed) {
    const DirectForm coding = form();
    if (coding == DirectForm::None) return 0;
    // Detection is told where in a longer read the text ceases to be ASCII.
    if (n != 1 && stream.asciiSoFar) return 0;
    const std::string_view ahead = bytes();
    if (ahead.empty() || (file && ahead.size() < n)) return 0;
    const char* const begin = ahead.data();
    if (n == 1) {
        consumed = decodeUnit(coding, begin, begin + ahead.size(), *out);
        take(begin, begin + consumed, 0);
        return consumed == 0 ? 0 : 1;
    }
    const Progress progress =
        decodeDirectly(coding, stream.tableOfConverter(), begin, ahead.size(), out, n);
    take(begin, begin + progress.taken, 0);
    consumed = progress.taken;
    return progress.made;
}

void UnitsAhead::take(const char* begin, const char* next, std::size_t givenBack) {
    if (text) text->current = next;
    if (!file || (next == begin && givenBack == 0)) return;
    file->recentBytes.add(begin, static_cast<std::size_t>(next - begin) + givenBack);
    file->lastByteRead = givenBack != 0 ? 0 : static_cast<unsigned char>(next[-1]);
    for (; givenBack != 0; --givenBack)
        file->recentBytes.drop();
    takeReadAhead(file->file, next);
}

unsigned UnitsAhead::firstCoded(DirectForm form) const {
    switch (form) {
        case DirectForm::Ascii:
        case DirectForm::Utf8:
            return 0x80;
        case DirectForm::Latin1:
            return 0x100;
        case DirectForm::Table:
            return stream.tableOfConverter()->isAsciiTransparent() ? 0x80 : 0;
        default:
            return 0;
    }
}

std::size_t UnitsAhead::decodeOther(DirectForm form, const char* next, const char* end,
                                    char16_t& unit) const {
    // The longest of these characters has two bytes.
    const auto ahead = static_cast<std::size_t>(end - next);
    const std::size_t shortest = form == DirectForm::Ascii || form == DirectForm::Table ? 1 : 2;
    for (std::size_t length = shortest; length <= 2 && length <= ahead; ++length) {
        const Progress progress =
            decodeDirectly(form, stream.tableOfConverter(), next, length, &unit, 1);
        if (progress.made == 1) return progress.taken;
    }
    return 0;
}

}  // namespace Orvandeil::FileIO::detail
