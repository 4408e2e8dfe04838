#include "fileio/scanf/fin_format_piece.h"

#include "fileio/errors/identifiers.h"
#include "fileio/host/messages.h"
#include "fileio/host/text.h"

#include <algorithm>
#include <climits>
#include <iterator>

namespace Orvandeil::FileIO {

template <class Unit>
finFormatPiece::HostText<Unit> finFormatPiece::copyText(const Unit* source, std::size_t count) {
    HostText<Unit> copy(static_cast<Unit*>(vxMemoryAllocateOrRaise((count + 1) * sizeof(Unit))));
    *std::copy_n(source, count, copy.get()) = 0;
    return copy;
}

void finFormatPiece::keepText(std::u16string_view source) {
    textLength = source.size() + 1;
    if (textLength <= std::size(shortText)) {
        *std::copy(source.begin(), source.end(), shortText) = 0;
        text = shortText;
    } else {
        longText = copyText(source.data(), source.size());
        text = longText.get();
    }
}

finFormatPiece::finFormatPiece(const finFormatPieceInitBlock& init)
    : width(init.width), savedWidth(init.width), suppress(init.suppress) {
    if (init.text.size() > INT_MAX) vxErrMsgId(KESTRA::legacy_two_part::p64bitsize());
    keepText(init.text);
}

finFormatPiece::finFormatPiece(const finFormatPiece& other)
    : fiMemoryOperationOverloads(other),
      width(other.width),
      savedWidth(other.savedWidth),
      suppress(other.suppress),
      oneChar(other.oneChar) {
    keepText(other.getText());
    if (other.asciiText) asciiText = copyText(other.asciiText.get(), textLength - 1);
}

finFormatPiece::~finFormatPiece() = default;

const char* finFormatPiece::getAsciiText() {
    const std::u16string_view units = getText();
    const auto isAscii = [](char16_t unit) { return unit < 0x80; };
    if (!asciiText && std::all_of(units.begin(), units.end(), isAscii)) {
        const std::string narrow(units.begin(), units.end());
        asciiText = copyText(narrow.data(), narrow.size());
    }
    return asciiText.get();
}

unsigned long finFormatPiece::fail(int reason, bool& failed, int& status) {
    failed = true;
    status = reason;
    return 0;
}

}  // namespace Orvandeil::FileIO
