#include "embedded/builtins/open_file.h"

#include "fileio/errors/code_list.h"
#include "fileio/errors/fi_error.h"
#include "fileio/host/text.h"

#include <cerrno>
#include <utility>

namespace Orvandeil::FileIO::embedded {
namespace {

void begin(OpenFile& file, Direction direction, int isBitTransfer, int dataSizeType) {
    const bool isRead = direction == Direction::Reading;
    if (!file.carry().CheckCarryByte(isBitTransfer, dataSizeType, isRead)) {
        throw CodeError(carryFailure(file));
    }
    if (isBitTransfer != 0) file.carry().active = true;
    // Bits that are appended are merged with what stands at the end, not where the file was opened.
    const bool mergesAtEnd =
        isBitTransfer != 0 && !isRead && file.permission.append && file.permission.update;
    const bool turns = file.direction != Direction::None && file.direction != direction;
    const bool moves = !file.stream->isScreen() && (turns || mergesAtEnd);
    if (moves && fseeko(file.handle.get(), 0, mergesAtEnd ? SEEK_END : SEEK_CUR) != 0) {
        throw CodeError(file.failure(code::FseekFailed));
    }
    file.direction = direction;
}

}  // namespace

void FileCloser::operator()(std::FILE* file) const noexcept {
    if (file != stdin && file != stdout && file != stderr) std::fclose(file);
}

OpenFile::OpenFile(std::string name, FileHandle openHandle, const FilePermission& openedWith,
                   const MachineFormat& defaultFormat)
    : label(std::move(name)),
      permission(openedWith),
      format(defaultFormat),
      handle(std::move(openHandle)) {}

void requireReadable(const OpenFile& file) {
    if (file.permission.read || file.permission.update) return;
    throw CodeError(file.failure(code::IsOpenWrite));
}

void requireWritable(const OpenFile& file) {
    if (!file.permission.read || file.permission.update) return;
    throw CodeError(file.failure(code::IsOpenRead));
}

void settleTransfer(OpenFile& file, Direction direction) {
    begin(file, direction, 0, file.format.dataSizeType);
}

void beginBitTransfer(OpenFile& file, Direction direction, int dataSizeType) {
    begin(file, direction, 1, dataSizeType);
}

Failure carryFailure(const OpenFile& file) {
    const std::u16string cause = fiPkStrerror(file.stream->getErrorCode());
    const std::string text = vxTextToNarrow(cause.data(), cause.size());
    return {code::WriteCarryByteFailed, text.empty() ? file.label : file.label + ": " + text};
}

Failure systemFailure(const OpenFile& file, int otherwise) {
    return file.failure(errno != 0 ? errno : otherwise);
}

}  // namespace Orvandeil::FileIO::embedded
