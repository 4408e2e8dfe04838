#include "fileio/host/text.h"
#include "fileio/text/blanks.h"
#include "fileio/text/tcodn_stream.h"
#include "fileio/text/units_ahead.h"

#include <algorithm>
#include <limits>

namespace Orvandeil::FileIO {
#ifdef FILEIO_FAST_PATHS
namespace {

using detail::Blanks;
using Verdict = detail::UnitsAhead::Verdict;

}  // namespace

// Takes what it can of a word, in memory that is there: only a unit read by itself asks for more.
// True when nothing of the word is left to read.
bool TcodnStream::takeWord(OutputBuffer& buffer, long width, long& count) {
    std::size_t room = std::min(buffer.getFreeRoom(), static_cast<std::size_t>(width - count));
    if (room == 0) return false;
    auto* const begin = static_cast<char16_t*>(buffer.Allocate(room));
    char16_t* next = begin;
    const char16_t* const end = begin + room;
    const bool isWithinWord = count != 0;
    const Blanks blanks;
    const bool ended = detail::UnitsAhead(*this).takeWhile([&](char16_t unit) {
        if (blanks.has(unit)) {
            return next == begin && !isWithinWord ? Verdict::Take : Verdict::GiveBack;
        }
        *next++ = unit;
        return next == end ? Verdict::TakeLast : Verdict::Take;
    });
    const auto stored = static_cast<std::size_t>(next - begin);
    buffer.SetLastChunkSize(stored);
    count += static_cast<long>(stored);
    return ended && (stored < room || count == width);
}

// True when something else comes next.
bool TcodnStream::takeBlanks() {
    const Blanks blanks;
    return detail::UnitsAhead(*this).takeWhile(
        [&blanks](char16_t unit) { return blanks.has(unit) ? Verdict::Take : Verdict::GiveBack; });
}
#endif

unsigned long TcodnStream::GetString(OutputBuffer& buffer, long width, bool noLimit) {
    long count = 0;
    while (noLimit || count < width) {
#ifdef FILEIO_FAST_PATHS
        if (takeWord(buffer, noLimit ? std::numeric_limits<long>::max() : width, count)) break;
#endif
        char16_t unit;
        std::size_t bytes = 0;
        if (GetNCodePoints(&unit, 1, &bytes) == 0) break;
        if (!qzu_isbreakablespace(unit)) {
            std::size_t room = 1;
            *static_cast<char16_t*>(buffer.Allocate(room)) = unit;
            ++count;
        } else if (count != 0) {
            giveBack(unit, bytes);
            break;
        }
    }
    return static_cast<unsigned long>(count);
}

void TcodnStream::SkipWhiteSpace() {
    std::size_t bytes = 0;
    do {
#ifdef FILEIO_FAST_PATHS
        if (takeBlanks()) return;
#endif
        if (GetNCodePoints(oneChar, 1, &bytes) == 0) return;
    } while (qzu_isbreakablespace(oneChar.front()));
    giveBack(oneChar.front(), bytes);
}

}  // namespace Orvandeil::FileIO
