#include "fileio/attributes/file_permission.h"
#include "fileio/attributes/machine_format.h"
#include "fileio/attributes/precision_string.h"
#include "tests/layout/slots.h"

namespace Orvandeil::FileIO {

PRIVATE_FIELDS(FilePermission, text, valid, read, write, append, update, binary, textMode,
               autoFlush, constructionFlag, pendingError, fileSystemFormat)

TEST(Layout, TextAttributes) {
    layout::expectSlots(2, SLOTS(FilePermission, Validate, Init));
    layout::expectSlots(2, SLOTS(MachineFormat, Validate, Init));
    layout::expectSlots(2, SLOTS(PrecisionString, Validate, Init));
    layout::expectOrder(LayoutProbe::fields<FilePermission>());
    layout::expectOrder(FIELDS(MachineFormat, text, valid, errorMessageNumber, dataSizeType));
    layout::expectOrder(FIELDS(PrecisionString, text, valid, outputType, machineFormat, repeatCount,
                               convertedSize, inputType, bitCount, allowConversion));
}

}  // namespace Orvandeil::FileIO
