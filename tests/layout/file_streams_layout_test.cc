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

TEST(Layout, FileStreams) {
    bool (fileStream::*fileSize)(long&) = &fileStream::getFileSize;
    EXPECT_EQ(layout::slotOf(fileSize), 20);
    layout::expectPlaces({SLOT(18, fileStream, GetLine), SLOT(19, fileStream, setPosition),
                          SLOT(21, fileStream, isFileOpen), SLOT(22, fileStream, flush),
                          SLOT(23, fileStream, isScreen), SLOT(24, fileStream, clearError),
                          SLOT(25, fileStream, CheckStreamEncoding)});
    layout::expectOrder(LayoutProbe::fields<fileStream>());
}

TEST(Layout, CarryBytes) {
    const std::vector<layout::Field> fields = LayoutProbe::fields<CarryByte>();
    EXPECT_EQ(fields.front().offset, sizeof(void*));
    layout::expectOrder(fields);
}

TEST(Layout, ConsoleStreams) {
    layout::expectPlaces({SLOT(26, screenStreamBase, getByte),  //
                          SLOT(27, outputScreenStream, printCommon)});
    EXPECT_EQ(sizeof(screenStreamBase), sizeof(fileStream));
    std::vector<layout::Field> fields = LayoutProbe::fields<outputScreenStream>();
    fields.push_back(LayoutProbe::fields<stdErrStream>().front());
    layout::expectOrder(fields);
}

}  // namespace
}  // namespace Orvandeil::FileIO
