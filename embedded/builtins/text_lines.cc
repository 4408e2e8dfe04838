#include "embedded/builtins/text_lines.h"

#include "fileio/buffers/host_block.h"
#include "fileio/buffers/output_buffer.h"

namespace Orvandeil::FileIO::embedded {

std::optional<Line> readLine(OpenFile& file, long maxCharacters, Terminators terminators) {
    constexpr std::size_t usualUnits = 128;
    constexpr std::size_t mostUnits = 1 << 20;
    requireReadable(file);
    beginTransfer(file, Direction::Reading);
    OutputBuffer units(vxCHAR_CLASS, usualUnits, usualUnits, mostUnits);
    const int codeBefore = file.stream->getErrorCode();
    Line line;
    line.result = file.stream->GetLine(maxCharacters, units);
    const std::size_t count = units.GetSize();
    const int code = file.stream->getErrorCode();
    if (count == 0) {
        if (code != 0) throw CodeError(file.failure(code));
        return std::nullopt;
    }
    // What could not be decoded is part of the line; the system's errors are not.
    if (code > 0 && code != codeBefore) line.failure = file.failure(code);
    const detail::HostBytes block(static_cast<char*>(units.TransferRaw()));
    const auto dropped = terminators == Terminators::Dropped ? line.result : 0;
    line.text.assign(reinterpret_cast<const char16_t*>(block.get()),
                     count - static_cast<std::size_t>(dropped));
    return line;
}

}  // namespace Orvandeil::FileIO::embedded
