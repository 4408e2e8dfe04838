#include "fileio/printf/fout_format_pieces.h"

namespace Orvandeil::FileIO {
namespace {

using Init = foutFormatPieceInitBlock;
using Piece = std::unique_ptr<foutFormatPiece>;

template <template <class, class> class BitPattern, class Plain>
Piece makeInteger(const Init& init) {
    switch (init.subformat) {
        case SubB:
            return std::make_unique<BitPattern<unsigned long, double>>(init);
        case SubT:
            return std::make_unique<BitPattern<unsigned int, float>>(init);
        default:
            return std::make_unique<Plain>(init);
    }
}

Piece makeConversion(const Init& init) {
    using Unsigned = foutFormatPieceForInteger<unsigned long>;
    switch (init.conversion) {
        case ConvO:
            return makeInteger<foutFormatPieceForObt, Unsigned>(init);
        case ConvU:
            return makeInteger<foutFormatPieceForUbt, Unsigned>(init);
        case ConvX:
            return makeInteger<foutFormatPieceForXbt, Unsigned>(init);
        case ConvE:
        case ConvF:
        case ConvG:
            return std::make_unique<foutFormatPieceForDouble>(init);
        case ConvS:
            return std::make_unique<foutFormatPieceForS>(init);
        case ConvC:
            return std::make_unique<foutFormatPieceForC>(init);
        default:
            return std::make_unique<foutFormatPieceForInteger<long>>(init);
    }
}

// The grammar of conversions is ASCII throughout.
std::string narrow(const std::u16string& text) {
    std::string result(text.size(), '\0');
    for (std::size_t i = 0; i < text.size(); ++i)
        result[i] = static_cast<char>(text[i]);
    return result;
}

}  // namespace

Piece foutFormatPiece::createFoutFormatPiece(PrintfFormat conversion, PrintfSubformat subformat,
                                             unsigned long numberedIndex, PrintFormatFlags flags,
                                             WidthPrecisionFieldType widthKind, int width,
                                             WidthPrecisionFieldType precisionKind, int precision,
                                             const std::u16string& subformatText, bool forceSign,
                                             unsigned long formatPosition) {
    Init init{{},        numberedIndex, flags,          widthKind,  width,    precisionKind,
              precision, forceSign,     formatPosition, conversion, subformat};
    if (conversion == NoConversion) {
        return std::make_unique<foutFormatPieceForLiterals>(init, subformatText);
    }
    init.printfFormat = narrow(subformatText);
    return makeConversion(init);
}

}  // namespace Orvandeil::FileIO
