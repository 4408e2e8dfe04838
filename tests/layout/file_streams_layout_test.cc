#include "fileio/streams/carry_byte.h"
#include "fileio/text/std_err_stream.h"
#include "tests/layout/slots.h"

namespace Orvandeil::FileIO {

PRIVATE_FIELDS(fileStream, file, permission, fileName, bytesWritten, lastByteRead, carryByte,
               spareText)
PRIVATE_FIELDS(CarryByte, active, carryValue, pendingBits, lastWasWrite, bitOrder, stream)
PRIVATE_FIELDS(outputScreenStream, bufferSize, bytesWritten, console)
PRIVATE_FIELDS(stdErrStream, errorConsole)

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

}  // namespace Orvandeil::FileIO
