#include "fileio/streams/file_stream.h"

namespace Orvandeil::FileIO {
namespace {

constexpr char16_t lineFeed = u'\n';
constexpr char16_t carriageReturn = u'\r';

void append(OutputBuffer& out, char16_t unit) {
    std::size_t room = 1;
    *static_cast<char16_t*>(out.Allocate(room)) = unit;
}

}  // namespace

int fileStream::GetLine(long maxCharacters, OutputBuffer& out) {
    constexpr long noLimit = -1;
    if (maxCharacters < 1 && maxCharacters != noLimit) return 0;
    int result = 0;
    long count = 0;
    char16_t unit = 0;
    while (result == 0 && count != maxCharacters && GetNCodePoints(&unit, 1, nullptr) != 0) {
        append(out, unit);
        ++count;
        if (unit != lineFeed && unit != carriageReturn) continue;
        result = count == maxCharacters ? 1 : completeTerminator(unit, out);
    }
    if (count != 0) checkForEndOfFile();
    return result;
}

// Reads what follows a terminator: the second half of a pair stays, anything else goes back.
int fileStream::completeTerminator(char16_t terminator, OutputBuffer& out) {
    char16_t next = 0;
    std::size_t bytes = 0;
    if (GetNCodePoints(&next, 1, &bytes) == 0) return 1;
    if (terminator == carriageReturn && next == lineFeed) {
        append(out, next);
        return 2;
    }
    Rewind(bytes);
    return 1;
}

}  // namespace Orvandeil::FileIO
