#pragma once

#include "embedded/builtins/code_error.h"
#include "fileio/attributes/file_permission.h"
#include "fileio/attributes/machine_format.h"
#include "fileio/streams/carry_byte.h"
#include "fileio/streams/file_stream.h"

#include <cstdio>
#include <memory>
#include <string>

namespace Orvandeil::FileIO::embedded {

// Closes a file unless it is one of the process's own.
struct FileCloser {
    void operator()(std::FILE* file) const noexcept;
};
using FileHandle = std::unique_ptr<std::FILE, FileCloser>;

enum class Direction { None, Reading, Writing };

// An open file with everything that its stream refers to. Streams keep addresses in it, so it stays
// where it is. Destroying it drops what was not settled; closeFile settles and reports.
struct OpenFile {
    OpenFile(std::string label, FileHandle handle, const FilePermission& permission,
             const MachineFormat& format);
    OpenFile(const OpenFile&) = delete;
    OpenFile& operator=(const OpenFile&) = delete;

    CarryByte& carry() { return stream->getCarryByte(); }
    // A failure of this file.
    Failure failure(int code) const { return {code, label}; }

    static constexpr std::size_t usualLine = 512;
    static constexpr std::size_t longestLineChunk = 1 << 20;

    const std::string label;  // as messages name the file
    FilePermission permission;
    MachineFormat format;  // of transfers that name none
    FileHandle handle;
    std::unique_ptr<fileStream> stream;
    // Empty between two lines, and keeps the memory of a short one.
    OutputBuffer lineUnits{vxCHAR_CLASS, usualLine, usualLine, longestLineChunk};
    Direction direction = Direction::None;  // of the last transfer since a positioning
};

// Throw CodeError -5 and -3 for a file that was opened for the other direction only.
void requireReadable(const OpenFile& file);
void requireWritable(const OpenFile& file);

// The part of beginTransfer for transfers that do not simply go on.
void settleTransfer(OpenFile& file, Direction direction);

// Every transfer begins with this: it settles the bits of the transfer before, and positions the
// file between reading and writing, as ISO C demands (7.21.5.3). CodeError -31 when bits cannot be
// settled, with the cause in its text, -33 when the file cannot be positioned.
inline void beginTransfer(OpenFile& file, Direction direction) {
    if (file.direction != direction || file.carry().active) settleTransfer(file, direction);
}
// The same for bit fields, which continue in the byte that the transfer before has used in part.
void beginBitTransfer(OpenFile& file, Direction direction, int dataSizeType);

// -31, with the cause that the stream has recorded.
Failure carryFailure(const OpenFile& file);
// The system's error, else `otherwise`.
Failure systemFailure(const OpenFile& file, int otherwise);

}  // namespace Orvandeil::FileIO::embedded
