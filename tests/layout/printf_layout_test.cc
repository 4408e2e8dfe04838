#include "fileio/printf/fout_format_pieces.h"
#include "fileio/printf/print_format_parser.h"
#include "fileio/printf/printf_argument_source.h"
#include "fileio/printf/printf_controller.h"
#include "tests/layout/slots.h"

namespace Orvandeil::FileIO {

template <>
std::vector<layout::Field> LayoutProbe::fields<FormatField>() {
    return {FIELD(FormatField, validator), FIELD(FormatField, kind), FIELD(FormatField, value),
            FIELD(FormatField, effective), FIELD(FormatField, negative)};
}

template <>
std::vector<layout::Field> LayoutProbe::fields<foutFormatPiece>() {
    return {FIELD(foutFormatPiece, variants),      FIELD(foutFormatPiece, variant),
            FIELD(foutFormatPiece, numberedIndex), FIELD(foutFormatPiece, flags),
            FIELD(foutFormatPiece, forceSign),     FIELD(foutFormatPiece, width),
            FIELD(foutFormatPiece, precision),     FIELD(foutFormatPiece, formatPosition)};
}

template <>
std::vector<layout::Field> LayoutProbe::fields<printfArgumentSource>() {
    return {FIELD(printfArgumentSource, args),     FIELD(printfArgumentSource, argc),
            FIELD(printfArgumentSource, argIndex), FIELD(printfArgumentSource, argLength),
            FIELD(printfArgumentSource, dims),     FIELD(printfArgumentSource, elementIndex),
            FIELD(printfArgumentSource, data)};
}

template <>
std::vector<layout::Field> LayoutProbe::fields<printfMatrixArgumentSource>() {
    return {FIELD(printfMatrixArgumentSource, data), FIELD(printfMatrixArgumentSource, rowStart),
            FIELD(printfMatrixArgumentSource, column)};
}

template <>
std::vector<layout::Field> LayoutProbe::fields<PrintFormatParser>() {
    using P = PrintFormatParser;
    return {FIELD(P, formatText),
            FIELD(P, formatCharacters),
            FIELD(P, forceSign),
            FIELD(P, conversionCount),
            FIELD(P, hasStringConversion),
            FIELD(P, lastLeftJustified),
            FIELD(P, trailingLiteral),
            FIELD(P, numberedIndex),
            FIELD(P, flags),
            FIELD(P, widthValue),
            FIELD(P, widthKind),
            FIELD(P, precisionValue),
            FIELD(P, precisionKind),
            FIELD(P, subformat),
            FIELD(P, conversion),
            FIELD(P, subformatText),
            FIELD(P, match),
            FIELD(P, argumentType),
            FIELD(P, pieces),
            FIELD(P, nextPiece),
            FIELD(P, recordedError)};
}

template <>
std::vector<layout::Field> LayoutProbe::fields<printfController>() {
    return {FIELD(printfController, errorCode), FIELD(printfController, parser),
            FIELD(printfController, source), FIELD(printfController, currentPiece),
            FIELD(printfController, output)};
}

namespace {

template <class Piece>
void expectPiece() {
    layout::expectPlaces({SLOT(2, Piece, consumesData), SLOT(3, Piece, isUnsigned),
                          SLOT(4, Piece, printByType), SLOT(5, Piece, getBufferSize),
                          SLOT(6, Piece, decidePrintMode)});
}

template <class Piece>
void expectBitPatternPiece() {
    expectPiece<Piece>();
    layout::expectPlaces({SLOT(7, Piece, formatBitPattern), SLOT(8, Piece, getDigitFieldLength),
                          SLOT(9, Piece, writePrefix)});
}

TEST(Layout, OutputPieces) {
    expectPiece<foutFormatPiece>();
    expectPiece<foutFormatPieceForLiterals>();
    expectPiece<foutFormatPieceForInteger<long>>();
    expectPiece<foutFormatPieceForS>();
    expectBitPatternPiece<foutFormatPieceForObt<unsigned long, double>>();
    expectBitPatternPiece<foutFormatPieceForXbt<unsigned int, float>>();
    layout::expectOrder(LayoutProbe::fields<FormatField>());
    layout::expectOrder(LayoutProbe::fields<foutFormatPiece>());
}

template <class Source>
void expectSource() {
    layout::expectPlaces({SLOT(2, Source, hasMoreData), SLOT(3, Source, setCurrentArgument),
                          SLOT(4, Source, hasCurrentArg), SLOT(5, Source, hasMoreArgs),
                          SLOT(6, Source, advanceArgument), SLOT(7, Source, advanceArgumentIndex),
                          SLOT(8, Source, remainingArgumentLength),
                          SLOT(9, Source, consumeArgument),
                          SLOT(10, Source, canUsePercentSOptimization)});
}

TEST(Layout, ArgumentSources) {
    expectSource<printfArgumentSource>();
    expectSource<printfSequentialArgumentSource>();
    expectSource<printfNumberedArgumentSource>();
    expectSource<printfMatrixArgumentSource>();
    layout::expectOrder(LayoutProbe::fields<printfArgumentSource>());
    layout::expectOrder(LayoutProbe::fields<printfMatrixArgumentSource>());
}

TEST(Layout, OutputDriver) {
    layout::expectOrder(LayoutProbe::fields<PrintFormatParser>());
    EXPECT_EQ(LayoutProbe::fields<PrintFormatParser>().front().offset, sizeof(void*));
    layout::expectOrder(LayoutProbe::fields<printfController>());
    EXPECT_EQ(LayoutProbe::fields<printfController>().front().offset, 0);
}

}  // namespace
}  // namespace Orvandeil::FileIO
