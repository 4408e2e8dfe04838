#include "embedded/builtins/print.h"

#include "embedded/builtins/open_close.h"
#include "fileio/errors/code_list.h"
#include "fileio/printf/printf_controller.h"

namespace Orvandeil::FileIO::embedded {

TcodnStream& beginPrint(OpenFile& file) {
    requireWritable(file);
    beginTransfer(file, Direction::Writing);
    return *file.stream;
}

std::optional<Failure> endPrint(OpenFile& file) {
    return file.permission.autoFlush ? flushBuffers(file) : std::nullopt;
}

std::optional<Failure> print(OpenFile& file, const std::u16string& format,
                             std::span<const vxArray*> arrays) {
    TcodnStream& stream = beginPrint(file);
    printfController controller(format, &stream, arrays.data(), static_cast<int>(arrays.size()));
    const bool complete = controller.doPrintf();
    const std::optional<Failure> flushed = endPrint(file);
    if (complete || controller.getErrorCode() == code::NotEnoughArgs) return flushed;
    return file.failure(controller.getErrorCode());
}

}  // namespace Orvandeil::FileIO::embedded
