#include "embedded/builtins/text_lines.h"

#include "fileio/buffers/output_buffer.h"

#include <iterator>

namespace Orvandeil::FileIO::embedded {
namespace {

// Empties a buffer with its scope. A line that lay in the first chunk leaves its memory to the
// next; of anything else, failures included, nothing is kept.
class Emptied {
public:
    explicit Emptied(OutputBuffer& filled) : buffer(filled) { buffer.SetRollbackPoint(); }
    Emptied(const Emptied&) = delete;
    Emptied& operator=(const Emptied&) = delete;
    ~Emptied() {
        if (buffer.GetSize() > OpenFile::usualLine) buffer.SetRollbackPoint();
        buffer.Rollback();
    }

private:
    OutputBuffer& buffer;
};

std::size_t keptOf(const Line& line, std::size_t count, Terminators terminators) {
    return terminators == Terminators::Kept ? count : count - static_cast<std::size_t>(line.result);
}

// By far the most lines lie in what the file has read ahead, and need no buffer.
bool takeLineAhead(OpenFile& file, Line& line, Terminators terminators) {
    char16_t units[OpenFile::usualLine];
    const std::size_t count = file.stream->takeLineAhead(units, std::size(units), line.result);
    line.usualText.append(units, count == 0 ? 0 : keptOf(line, count, terminators));
    return count != 0;
}

// The first chunk has at least the usual size, so that a line of it is in one piece.
void takeText(Line& line, OutputBuffer& units, std::size_t count) {
    if (units.GetSize() <= OpenFile::usualLine) {
        units.ResetNext();
        line.usualText.assign(static_cast<const char16_t*>(units.GetNext()), count);
    } else {
        line.block.reset(static_cast<char*>(units.TransferRaw()));
        line.blockUnits = count;
    }
}

}  // namespace

bool readLine(OpenFile& file, Line& line, long maxCharacters, Terminators terminators) {
    line.usualText.clear();
    line.block.reset();
    line.failure.reset();
    requireReadable(file);
    beginTransfer(file, Direction::Reading);
    if (maxCharacters == anyLength && takeLineAhead(file, line, terminators)) return true;
    OutputBuffer& units = file.lineUnits;
    const Emptied emptied(units);
    const int codeBefore = file.stream->getErrorCode();
    line.result = file.stream->GetLine(maxCharacters, units);
    const std::size_t count = units.GetSize();
    const int code = file.stream->getErrorCode();
    if (count == 0) {
        if (code != 0) throw CodeError(file.failure(code));
        return false;
    }
    // What could not be decoded is part of the line; the system's errors are not.
    if (code > 0 && code != codeBefore) line.failure = file.failure(code);
    takeText(line, units, keptOf(line, count, terminators));
    return true;
}

std::optional<Line> readLine(OpenFile& file, long maxCharacters, Terminators terminators) {
    Line line;
    if (!readLine(file, line, maxCharacters, terminators)) return std::nullopt;
    return line;
}

}  // namespace Orvandeil::FileIO::embedded
