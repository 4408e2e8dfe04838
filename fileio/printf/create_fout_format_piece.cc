#include "fileio/printf/fout_format_pieces.h"

namespace Orvandeil::FileIO {
namespace {

using Init = foutFormatPieceInitBlock;
using Pieces = foutFormatPieceList;

template <template <class, class> class BitPattern, class Plain>
void addInteger(Pieces& pieces, const Init& init) {
    switch (init.subformat) {
        case SubB:
            pieces.emplace<BitPattern<unsigned long, double>>(init);
            break;
        case SubT:
            pieces.emplace<BitPattern<unsigned int, float>>(init);
            break;
        default:
            pieces.emplace<Plain>(init);
    }
}

}  // namespace

void foutFormatPiece::createFoutFormatPiece(Pieces& pieces, const Init& init) {
    using Unsigned = foutFormatPieceForInteger<unsigned long>;
    switch (init.conversion) {
        case NoConversion:
            pieces.emplace<foutFormatPieceForLiterals>(init);
            break;
        case ConvD:
        case ConvI:
            pieces.emplace<foutFormatPieceForInteger<long>>(init);
            break;
        case ConvO:
            return addInteger<foutFormatPieceForObt, Unsigned>(pieces, init);
        case ConvU:
            return addInteger<foutFormatPieceForUbt, Unsigned>(pieces, init);
        case ConvX:
            return addInteger<foutFormatPieceForXbt, Unsigned>(pieces, init);
        case ConvE:
        case ConvF:
        case ConvG:
            pieces.emplace<foutFormatPieceForDouble>(init);
            break;
        case ConvS:
            pieces.emplace<foutFormatPieceForS>(init);
            break;
        case ConvC:
            pieces.emplace<foutFormatPieceForC>(init);
            break;
    }
}

}  // namespace Orvandeil::FileIO
