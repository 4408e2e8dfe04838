#include "fileio/printf/fout_format_pieces.h"
#include "fileio/printf/print_format_parser.h"
#include "fileio/printf/printf_argument_source.h"
#include "fileio/printf/printf_controller.h"
#include "tests/layout/slots.h"

namespace Orvandeil::FileIO {

PRIVATE_FIELDS(FormatField, validator, kind, value, effective, negative)
PRIVATE_FIELDS(foutFormatPiece, variants, variant, numberedIndex, flags, forceSign, width,
               precision, formatPosition)
PRIVATE_FIELDS(printfArgumentSource, args, argc, argIndex, argLength, dims, elementIndex, data)
PRIVATE_FIELDS(printfMatrixArgumentSource, data, rowStart, column)
PRIVATE_FIELDS(PrintFormatParser, formatText, formatCharacters, forceSign, conversionCount,
               hasStringConversion, lastLeftJustified, trailingLiteral, numberedIndex, flags,
               widthValue, widthKind, precisionValue, precisionKind, subformat, conversion,
               subformatText, match, argumentType, pieces, nextPiece, recordedError)
PRIVATE_FIELDS(printfController, errorCode, parser, source, currentPiece, output)

namespace {

template <class Piece>
void expectPiece() {
    layout::expectSlots(
        2, SLOTS(Piece, consumesData, isUnsigned, printByType, getBufferSize, decidePrintMode));
}

template <class Piece>
void expectBitPatternPiece() {
    expectPiece<Piece>();
    layout::expectSlots(7, SLOTS(Piece, formatBitPattern, getDigitFieldLength, writePrefix));
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
    layout::expectSlots(
        2, SLOTS(Source, hasMoreData, setCurrentArgument, hasCurrentArg, hasMoreArgs,
                 advanceArgument, advanceArgumentIndex, remainingArgumentLength, consumeArgument,
                 canUsePercentSOptimization));
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
    layout::expectOrder(LayoutProbe::fields<PrintFormatParser>(), sizeof(void*));
    layout::expectOrder(LayoutProbe::fields<printfController>(), 0);
}

}  // namespace
}  // namespace Orvandeil::FileIO
