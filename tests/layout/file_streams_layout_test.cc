#include "fileio/streams/carry_byte.h"
#include "fileio/text/std_err_stream.h"
#include "tests/layout/slots.h"

namespace Orvandeil::FileIO {

template <>
std::vector<layout::Field> LayoutProbe::fields<fileStream>() {
    return {FIELD(fileStream, file),         FIELD(fileStream, permission),
            FIELD(fileStream, fileName),     FIELD(fileStream, bytesWritten),
            FIELD(fileStream, lastByteRead), FIELD(fileStream, carryByte),
            FIELD(fileStream, spareText)};
}

template <>
std::vector<layout::Field> LayoutProbe::fields<CarryByte>() {
    return {FIELD(CarryByte, active),      FIELD(CarryByte, carryValue),
            FIELD(CarryByte, pendingBits), FIELD(CarryByte, lastWasWrite),
            FIELD(CarryByte, bitOrder),    FIELD(CarryByte, stream)};
}

template <>
std::vector<layout::Field> LayoutProbe::fields<outputScreenStream>() {
    return {FIELD(outputScreenStream, bufferSize), FIELD(outputScreenStream, bytesWritten),
            FIELD(outputScreenStream, console)};
}

template <>
std::vector<layout::Field> LayoutProbe::fields<stdErrStream>() {
    return {FIELD(stdErrStream, errorConsole)};
}

namespace {

template <class S>
std::vector<layout::Place> fileStreamPlaces() {
    unsigned long (S::*read)(unsigned long, char*, unsigned long) = &S::GetNElements;
    bool (S::*fileSize)(long&) = &S::getFileSize;
    return {{__LINE__, "GetNElements", 3, layout::slotOf(read)},
            {__LINE__, "getFileSize", 20, layout::slotOf(fileSize)},
            SLOT(2, S, getPosition),
            SLOT(4, S, PutNElements),
            SLOT(5, S, print),
            SLOT(6, S, EndOfData),
            SLOT(7, S, Rewind),
            SLOT(8, S, setBufferSize),
            SLOT(9, S, needsBufferSize),
            SLOT(10, S, scanOctal),
            SLOT(11, S, scanHex),
            SLOT(12, S, scanUnsignedInteger),
            SLOT(13, S, scanInteger),
            SLOT(14, S, scanIntegerCouldBeHex),
            SLOT(15, S, scanFloat),
            SLOT(16, S, PutNCharacters),
            SLOT(17, S, DetectCharset),
            SLOT(18, S, GetLine),
            SLOT(19, S, setPosition),
            SLOT(21, S, isFileOpen),
            SLOT(22, S, flush),
            SLOT(23, S, isScreen),
            SLOT(24, S, clearError),
            SLOT(25, S, CheckStreamEncoding)};
}

TEST(Layout, FileStreams) {
    layout::expectPlaces(fileStreamPlaces<fileStream>());
    layout::expectOrder(LayoutProbe::fields<fileStream>());
    unsigned long (fileStream::*count)(unsigned long, OutputBuffer&, unsigned long) =
        &fileStream::GetNElements;
    EXPECT_EQ(layout::slotOf(count), -1);
    EXPECT_EQ(layout::slotOf(&fileStream::GetCurrentByteInStream), -1);
}

TEST(Layout, CarryBytes) {
    const std::vector<layout::Field> fields = LayoutProbe::fields<CarryByte>();
    EXPECT_EQ(fields.front().offset, sizeof(void*));
    layout::expectOrder(fields);
    EXPECT_EQ(layout::slotOf(&CarryByte::CheckCarryByte), -1);
}

TEST(Layout, ConsoleStreams) {
    layout::expectPlaces(fileStreamPlaces<screenStreamBase>());
    layout::expectPlaces(fileStreamPlaces<stdErrStream>());
    layout::expectPlaces({SLOT(26, screenStreamBase, getByte), SLOT(26, stdErrStream, getByte),
                          SLOT(27, outputScreenStream, printCommon)});
    EXPECT_EQ(sizeof(screenStreamBase), sizeof(fileStream));
    std::vector<layout::Field> fields = LayoutProbe::fields<outputScreenStream>();
    fields.push_back(LayoutProbe::fields<stdErrStream>().front());
    layout::expectOrder(fields);
}

}  // namespace
}  // namespace Orvandeil::FileIO
