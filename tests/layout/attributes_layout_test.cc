#include "fileio/attributes/file_permission.h"
#include "fileio/attributes/machine_format.h"
#include "fileio/attributes/precision_string.h"
#include "tests/layout/slots.h"

namespace Orvandeil::FileIO {

template <>
std::vector<layout::Field> LayoutProbe::fields<FilePermission>() {
    return {FIELD(FilePermission, text),         FIELD(FilePermission, valid),
            FIELD(FilePermission, read),         FIELD(FilePermission, write),
            FIELD(FilePermission, append),       FIELD(FilePermission, update),
            FIELD(FilePermission, binary),       FIELD(FilePermission, textMode),
            FIELD(FilePermission, autoFlush),    FIELD(FilePermission, constructionFlag),
            FIELD(FilePermission, pendingError), FIELD(FilePermission, fileSystemFormat)};
}

namespace {

template <class Attribute>
void expectTextAttribute() {
    layout::expectPlaces({SLOT(2, Attribute, Validate), SLOT(3, Attribute, Init)});
}

TEST(Layout, TextAttributes) {
    expectTextAttribute<FilePermission>();
    expectTextAttribute<MachineFormat>();
    expectTextAttribute<PrecisionString>();
    layout::expectOrder(LayoutProbe::fields<FilePermission>());
    layout::expectOrder({FIELD(MachineFormat, text), FIELD(MachineFormat, valid),
                         FIELD(MachineFormat, errorMessageNumber),
                         FIELD(MachineFormat, dataSizeType)});
    layout::expectOrder({FIELD(PrecisionString, text), FIELD(PrecisionString, valid),
                         FIELD(PrecisionString, outputType), FIELD(PrecisionString, machineFormat),
                         FIELD(PrecisionString, repeatCount), FIELD(PrecisionString, convertedSize),
                         FIELD(PrecisionString, inputType), FIELD(PrecisionString, bitCount),
                         FIELD(PrecisionString, allowConversion)});
}

}  // namespace
}  // namespace Orvandeil::FileIO
