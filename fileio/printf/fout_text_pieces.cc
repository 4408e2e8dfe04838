#include "fileio/errors/code_list.h"
#include "fileio/printf/fout_format_pieces.h"
#include "fileio/printf/printf_argument_source.h"
#include "fileio/text/tcodn_stream.h"

#include <algorithm>

namespace Orvandeil::FileIO {

foutFormatPieceForLiterals::foutFormatPieceForLiterals(const foutFormatPieceInitBlock& init)
    : foutFormatPiece(init), text(init.written) {}

void foutFormatPieceForLiterals::printByType(TcodnStream* out, printfArgumentSource*) {
    if (out->needsBufferSize()) out->setBufferSize(getBufferSize());
    if (out->PutString(text) < text.size()) throw out->getErrorCode();
}

Printability foutFormatPieceForLiterals::decidePrintMode(printfArgumentSource*) const {
    return Printable;
}

std::u16string_view literalTextOf(const foutFormatPiece& piece) {
    if (piece.getConversion() != NoConversion) return {};
    return static_cast<const foutFormatPieceForLiterals&>(piece).getText();
}

void foutFormatPieceForS::printByType(TcodnStream* out, printfArgumentSource* source) {
    std::u16string_view text;
    try {
        text = source->getCurrentArgumentAsString(scratch);
    } catch (int failure) {
        // An object without elements prints nothing at all, not even its width.
        if (failure == code::EmptyArg) return;
        throw;
    }
    if (hasPrecision()) text = text.substr(0, static_cast<std::size_t>(precision.getEffective()));
    printPadded(out, text);
}

Printability foutFormatPieceForS::decidePrintMode(printfArgumentSource* source) const {
    return source->isCurrentArgumentEmpty() ? Printable
                                            : source->checkPrintabilityByType<char16_t>();
}

void foutFormatPieceForC::printByType(TcodnStream* out, printfArgumentSource* source) {
    if (!source->prepareCurrentArgument(true)) return printWidthBuffer(out, 0);
    if (out->needsBufferSize()) out->setBufferSize(getBufferSize());
    const char16_t unit = source->getCurrentArgumentAs<char16_t>();
    printPadded(out, std::u16string_view(&unit, 1));
}

Printability foutFormatPieceForC::decidePrintMode(printfArgumentSource* source) const {
    return source->checkPrintabilityByType<char16_t>();
}

}  // namespace Orvandeil::FileIO
