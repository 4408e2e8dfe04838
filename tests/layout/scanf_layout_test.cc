#include "fileio/scanf/fin_format_pieces.h"
#include "fileio/scanf/scan_control.h"
#include "tests/layout/slots.h"

namespace Orvandeil::FileIO {

using IntegerPiece = finFormatPieceT<IntegerReadingFunctor<long long>, 14>;

template <>
std::vector<layout::Field> LayoutProbe::fields<finFormatPiece>() {
    return {FIELD(finFormatPiece, width),      FIELD(finFormatPiece, savedWidth),
            FIELD(finFormatPiece, text),       FIELD(finFormatPiece, asciiText),
            FIELD(finFormatPiece, textLength), FIELD(finFormatPiece, suppress),
            FIELD(finFormatPiece, oneChar)};
}

template <>
std::vector<layout::Field> LayoutProbe::fields<finFormatParser>() {
    return {FIELD(finFormatParser, input),       FIELD(finFormatParser, pieceStart),
            FIELD(finFormatParser, cursor),      FIELD(finFormatParser, recycled),
            FIELD(finFormatParser, pieces),      FIELD(finFormatParser, nextIndex),
            FIELD(finFormatParser, resultClass), FIELD(finFormatParser, error)};
}

template <>
std::vector<layout::Field> LayoutProbe::fields<scanControl>() {
    return {FIELD(scanControl, limit),  FIELD(scanControl, unlimited),   FIELD(scanControl, piece),
            FIELD(scanControl, count),  FIELD(scanControl, input),       FIELD(scanControl, parser),
            FIELD(scanControl, buffer), FIELD(scanControl, conversions), FIELD(scanControl, error)};
}

// The first field of each kind of piece behind the common ones.
template <>
std::vector<layout::Field> LayoutProbe::fields<IntegerPiece>() {
    return {FIELD(IntegerPiece, value), FIELD(finFormatPieceLiteral, source),
            FIELD(finFormatPieceCMATCH, open), FIELD(finFormatPieceError, code)};
}

namespace {

template <class Piece>
std::vector<layout::Place> piecePlaces() {
    return {SLOT(2, Piece, clone), SLOT(3, Piece, isLiteral), SLOT(4, Piece, getClassID),
            SLOT(5, Piece, scan)};
}

TEST(Layout, ScanPieces) {
    layout::expectPlaces(piecePlaces<finFormatPiece>());
    layout::expectPlaces(piecePlaces<IntegerPiece>());
    layout::expectPlaces(piecePlaces<finFormatPieceS>());
    layout::expectPlaces(piecePlaces<finFormatPieceC>());
    layout::expectPlaces(piecePlaces<finFormatPieceCMATCH>());
    layout::expectPlaces(piecePlaces<finFormatPieceLiteral>());
    layout::expectPlaces(piecePlaces<finFormatPieceError>());

    const std::vector<layout::Field> fields = LayoutProbe::fields<finFormatPiece>();
    EXPECT_EQ(fields.front().offset, sizeof(void*));
    layout::expectOrder(fields);
    for (const layout::Field& own : LayoutProbe::fields<IntegerPiece>())
        layout::expectOrder({fields.back(), own});
}

TEST(Layout, ScanDriver) {
    layout::expectPlaces({SLOT(0, scanControl, pieceFlag)});
    const std::vector<layout::Field> fields = LayoutProbe::fields<scanControl>();
    EXPECT_EQ(fields.front().offset, sizeof(void*));
    layout::expectOrder(fields);
    layout::expectOrder(LayoutProbe::fields<finFormatParser>());
}

}  // namespace
}  // namespace Orvandeil::FileIO
