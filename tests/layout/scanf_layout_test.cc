#include "fileio/scanf/fin_format_pieces.h"
#include "fileio/scanf/scan_control.h"
#include "tests/layout/slots.h"

namespace Orvandeil::FileIO {

using IntegerPiece = finFormatPieceT<IntegerReadingFunctor<long long>, 14>;

PRIVATE_FIELDS(finFormatPiece, width, savedWidth, text, asciiText, textLength, suppress, oneChar)
PRIVATE_FIELDS(finFormatParser, input, pieceStart, cursor, recycled, pieces, nextIndex, resultClass,
               error)
PRIVATE_FIELDS(scanControl, limit, unlimited, piece, count, input, parser, buffer, conversions,
               error)
PRIVATE_FIELDS(IntegerPiece, value)
PRIVATE_FIELDS(finFormatPieceLiteral, source)
PRIVATE_FIELDS(finFormatPieceCMATCH, open)
PRIVATE_FIELDS(finFormatPieceError, code)

namespace {

template <class Piece>
void expectPiece() {
    layout::expectSlots(2, SLOTS(Piece, clone, isLiteral, getClassID, scan));
}

// The fields of each kind of piece stand behind the common ones.
template <class Piece>
void expectPieceWithFields() {
    expectPiece<Piece>();
    layout::Places fields = LayoutProbe::fields<finFormatPiece>();
    fields.push_back(LayoutProbe::fields<Piece>().front());
    layout::expectOrder(fields, sizeof(void*));
}

TEST(Layout, ScanPieces) {
    expectPiece<finFormatPiece>();
    expectPiece<finFormatPieceS>();
    expectPiece<finFormatPieceC>();
    expectPieceWithFields<IntegerPiece>();
    expectPieceWithFields<finFormatPieceCMATCH>();
    expectPieceWithFields<finFormatPieceLiteral>();
    expectPieceWithFields<finFormatPieceError>();
}

TEST(Layout, ScanDriver) {
    layout::expectSlots(0, SLOTS(scanControl, pieceFlag));
    layout::expectOrder(LayoutProbe::fields<scanControl>(), sizeof(void*));
    layout::expectOrder(LayoutProbe::fields<finFormatParser>());
}

}  // namespace
}  // namespace Orvandeil::FileIO
