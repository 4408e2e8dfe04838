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
    Line line;
    line.result = file.stream->GetLine(maxCharacters, units);
    const std::size_t count = units.GetSize();
    // A line cut short by a failure is delivered; the next call meets the failure again.
    if (count == 0) {
        const int code = file.stream->getErrorCode();
        if (code != 0) throw CodeError(file.failure(code));
        return std::nullopt;
    }
    const detail::HostBytes block(static_cast<char*>(units.TransferRaw()));
    const auto dropped = terminators == Terminators::Dropped ? line.result : 0;
    line.text.assign(reinterpret_cast<const char16_t*>(block.get()),
                     count - static_cast<std::size_t>(dropped));
    return line;
}

}  // namespace Orvandeil::FileIO::embedded
