#include "fileio/attributes/file_permission.h"
#include "fileio/attributes/machine_format.h"
#include "fileio/attributes/precision_string.h"
#include "fileio/attributes/size_attribute.h"
#include "fileio/attributes/skip_attribute.h"
#include "fileio/buffers/output_buffer.h"
#include "fileio/errors/identifiers.h"
#include "fileio/host/exception.h"
#include "fileio/printf/fout_format_pieces.h"
#include "fileio/printf/print_format_parser.h"
#include "fileio/printf/printf_argument_source.h"
#include "fileio/printf/printf_controller.h"
#include "fileio/scanf/fin_format_pieces.h"
#include "fileio/scanf/scan_control.h"
#include "fileio/streams/carry_byte.h"
#include "fileio/text/input_string_stream.h"
#include "fileio/text/output_string_stream.h"
#include "fileio/text/std_err_stream.h"
#include "tests/layout/slots.h"

namespace Orvandeil::FileIO {

using foundation::core::except::IMsgIDException;
using Concrete = foundation::core::except::Exception<KESTRA::FileIO::Errno, std::exception>;
using IntegerPiece = finFormatPieceT<IntegerReadingFunctor<long long>, 14>;

PRIVATE_FIELDS(TcodnStream, converter, latinFixed, utf16, asciiSoFar, readBytes, oneChar,
               writeBytes, asciiText)
PRIVATE_FIELDS(inputStringStream, begin, current, end, scratch)
PRIVATE_FIELDS(outputStringStream, data, capacity, cursor, bufferSize, mark, printScratch)
PRIVATE_FIELDS(fileStream, file, permission, fileName, bytesWritten, lastByteRead, carryByte,
               spareText)
PRIVATE_FIELDS(CarryByte, active, carryValue, pendingBits, lastWasWrite, bitOrder, stream)
PRIVATE_FIELDS(outputScreenStream, bufferSize, bytesWritten, console)
PRIVATE_FIELDS(stdErrStream, errorConsole)
PRIVATE_FIELDS(FilePermission, text, valid, read, write, append, update, binary, textMode,
               autoFlush, constructionFlag, pendingError, fileSystemFormat)
PRIVATE_FIELDS(OutputBuffer, minChunk, maxChunk, currentCapacity, lastRequest, chunks, chunkCounts,
               elementsBeforeLast, classID, typeSize, rollbackStart, rollbackChunk, nextChunk,
               nextElement)
PRIVATE_FIELDS(FormatField, validator, kind, value, effective, negative)
PRIVATE_FIELDS(foutFormatPiece, variants, variant, numberedIndex, flags, forceSign, width,
               precision, formatPosition)
PRIVATE_FIELDS(printfArgumentSource, args, argc, argIndex, argLength, dims, elementIndex, data)
PRIVATE_FIELDS(printfMatrixArgumentSource, data, rowStart, column)
PRIVATE_FIELDS(PrintFormatParser, formatText, formatCharacters, forceSign, conversionCount,
               hasStringConversion, lastLeftJustified, trailingLiteral, piece, match, argumentType,
               pieces, nextPiece, recordedError)
PRIVATE_FIELDS(foutFormatPieceInitBlock, numberedIndex, flags, width, widthKind, precision,
               precisionKind, subformat, conversion, written)
PRIVATE_FIELDS(printfController, errorCode, parser, source, currentPiece, output)
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

TEST(Layout, Exceptions) {
    layout::expectSlots(0, SLOTS(IMsgIDException, clone, rethrow));
    layout::expectSlots(4, SLOTS(IMsgIDException, what, GetID, GetBaseMsgIDObj));
    layout::expectSlots(0, SLOTS(Concrete, clone, rethrow));
    layout::expectSlots(4, SLOTS(Concrete, what, GetID, GetBaseMsgIDObj));

    const Concrete error{KESTRA::FileIO::Errno("text")};
    const void* whole = &error;
    EXPECT_EQ(static_cast<const IMsgIDException*>(&error), whole);
    EXPECT_GT(static_cast<const void*>(static_cast<const std::exception*>(&error)), whole);
}

template <class S>
void expectStream() {
    layout::expectSlots(
        2, SLOTS(S, getPosition, GetNElements, PutNElements, print, EndOfData, Rewind,
                 setBufferSize, needsBufferSize, scanOctal, scanHex, scanUnsignedInteger,
                 scanInteger, scanIntegerCouldBeHex, scanFloat));
}

TEST(Layout, Streams) {
    struct Opened : stream {
        using stream::errorCode;
    };
    expectStream<stream>();
    EXPECT_EQ(layout::slotOf(&stream::getErrorCode), -1);
    EXPECT_EQ(layout::offsetOf(&Opened::errorCode), sizeof(void*));
    expectStream<TcodnStream>();
    layout::expectSlots(16, SLOTS(TcodnStream, PutNCharacters, DetectCharset));
    layout::expectOrder(LayoutProbe::fields<TcodnStream>());
}

TEST(Layout, StringStreams) {
    expectStream<inputStringStream>();
    layout::expectSlots(17, SLOTS(inputStringStream, DetectCharset, getUTF16Position));
    layout::expectOrder(LayoutProbe::fields<inputStringStream>(), sizeof(TcodnStream));
    expectStream<outputStringStream>();
    layout::expectSlots(17, SLOTS(outputStringStream, DetectCharset, Reset));
    layout::expectOrder(LayoutProbe::fields<outputStringStream>());
}

TEST(Layout, FileStreams) {
    bool (fileStream::*fileSize)(long&) = &fileStream::getFileSize;
    EXPECT_EQ(layout::slotOf(fileSize), 20);
    layout::expectSlots(18, SLOTS(fileStream, GetLine, setPosition));
    layout::expectSlots(
        21, SLOTS(fileStream, isFileOpen, flush, isScreen, clearError, CheckStreamEncoding));
    layout::expectOrder(LayoutProbe::fields<fileStream>());
    layout::expectOrder(LayoutProbe::fields<CarryByte>(), sizeof(void*));
}

TEST(Layout, ConsoleStreams) {
    layout::expectSlots(26, SLOTS(screenStreamBase, getByte));
    layout::expectSlots(27, SLOTS(outputScreenStream, printCommon));
    EXPECT_EQ(sizeof(screenStreamBase), sizeof(fileStream));
    layout::Places fields = LayoutProbe::fields<outputScreenStream>();
    fields.push_back(LayoutProbe::fields<stdErrStream>().front());
    layout::expectOrder(fields);
}

TEST(Layout, TextAttributes) {
    layout::expectSlots(2, SLOTS(FilePermission, Validate, Init));
    layout::expectSlots(2, SLOTS(MachineFormat, Validate, Init));
    layout::expectSlots(2, SLOTS(PrecisionString, Validate, Init));
    layout::expectOrder(LayoutProbe::fields<FilePermission>());
    layout::expectOrder(FIELDS(MachineFormat, text, valid, errorMessageNumber, dataSizeType));
    layout::expectOrder(FIELDS(PrecisionString, text, valid, outputType, machineFormat, repeatCount,
                               convertedSize, inputType, bitCount, allowConversion));
}

TEST(Layout, NumericAttributes) {
    struct Opened : NumericAttr {
        using NumericAttr::error;
        using NumericAttr::valid;
    };
    layout::expectSlots(2, SLOTS(NumericAttr, IsValid, Validate));
    layout::Places size = FIELDS(Opened, valid, error);
    const layout::Places own = FIELDS(SizeAttribute, m, n, isMatrix, isInfinite);
    size.insert(size.end(), own.begin(), own.end());
    layout::expectOrder(size);
    EXPECT_LT(layout::offsetOf(&Opened::error), layout::offsetOf(&SkipAttribute::skip));
}

TEST(Layout, OutputBuffers) {
    layout::expectOrder(LayoutProbe::fields<OutputBuffer>(), sizeof(void*));
}

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
    layout::expectOrder(LayoutProbe::fields<foutFormatPieceInitBlock>(), 0);
    layout::expectOrder(LayoutProbe::fields<printfController>(), 0);
}

template <class Piece>
void expectInputPiece() {
    layout::expectSlots(2, SLOTS(Piece, clone, isLiteral, getClassID, scan));
}

// The fields of each kind of piece stand behind the common ones.
template <class Piece>
void expectPieceWithFields() {
    expectInputPiece<Piece>();
    layout::Places fields = LayoutProbe::fields<finFormatPiece>();
    fields.push_back(LayoutProbe::fields<Piece>().front());
    layout::expectOrder(fields, sizeof(void*));
}

TEST(Layout, ScanPieces) {
    expectInputPiece<finFormatPiece>();
    expectInputPiece<finFormatPieceS>();
    expectInputPiece<finFormatPieceC>();
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
