#include "fileio/scanf/fin_format_pieces.h"

#include "fileio/errors/code_list.h"
#include "fileio/host/text.h"
#include "fileio/text/units_ahead.h"

#include <algorithm>
#include <limits>
#include <utility>

#include <unicode/utf16.h>

namespace Orvandeil::FileIO {
namespace {

constexpr std::size_t firstTextChunk = 1024;
constexpr std::size_t smallestTextChunk = 64;
constexpr std::size_t largestTextChunk = 8388608;

// Lets `read` append characters to the result: straight away when it holds characters, else
// through a buffer of their own. False when there were none.
template <class Read>
bool appendText(OutputBuffer& result, bool suppress, Read read) {
    if (!suppress && result.GetClassID() == vxCHAR_CLASS) return read(result) != 0;
    OutputBuffer text(vxCHAR_CLASS, firstTextChunk, smallestTextChunk, largestTextChunk);
    if (read(text) == 0) return false;
    if (!suppress) result.AppendBuffer(text);
    return true;
}

// Takes one code point of a NUL-terminated text.
char32_t nextCodePoint(const char16_t*& text) {
    int length = 0;
    UChar32 point;
    U16_NEXT(text, length, -1, point);
    text += length;
    return static_cast<char32_t>(point);
}

}  // namespace

unsigned long finFormatPieceS::scan(TcodnStream& input, OutputBuffer& result, bool /*hostFlag*/,
                                    bool& failed, int& status) {
    const auto readWord = [this, &input](OutputBuffer& out) {
        return input.GetString(out, std::max(width, 0), width < 0);
    };
    if (!appendText(result, suppress, readWord)) return fail(input.getErrorCode(), failed, status);
    return suppress ? 0 : 1;
}

unsigned long finFormatPieceC::scan(TcodnStream& input, OutputBuffer& result, bool /*hostFlag*/,
                                    bool& failed, int& status) {
    const auto readCharacters = [this, &input](OutputBuffer& out) {
        return input.GetNCodePoints(out, static_cast<unsigned long>(std::max(width, 1)), nullptr);
    };
    if (!appendText(result, suppress, readCharacters))
        return fail(input.getErrorCode(), failed, status);
    return suppress ? 0 : 1;
}

finFormatPieceCMATCH::finFormatPieceCMATCH(const finFormatPieceInitBlock& init,
                                           std::size_t openBracket)
    : finFormatPieceOfText(init), open(openBracket) {}

unsigned long finFormatPieceCMATCH::scan(TcodnStream& input, OutputBuffer& result,
                                         bool /*hostFlag*/, bool& failed, int& status) {
    bool matched = false;
    for (; width != 0; width -= width > 0 ? 1 : 0) {
#ifdef FILEIO_FAST_PATHS
        if (takeMatches(input, result, matched)) break;
#endif
        std::size_t bytes = 0;
        if (input.GetNCodePoints(oneChar, 1, &bytes) == 0) {
            if (!matched) return fail(0, failed, status);
            break;
        }
        if (!accepts(oneChar.front())) {
            input.giveBack(oneChar.front(), bytes);
            break;
        }
        matched = true;
        if (!suppress) result.AppendData(vxCHAR_CLASS, oneChar.data(), oneChar.size());
    }
    if (!matched) return fail(code::MatchingFailure, failed, status);
    return suppress ? 0 : 1;
}

#ifdef FILEIO_FAST_PATHS
// Takes what it can of the matches, in memory that is there: only a character read by itself asks
// for more. True when there are no more of them.
bool finFormatPieceCMATCH::takeMatches(TcodnStream& input, OutputBuffer& result, bool& matched) {
    using Verdict = detail::UnitsAhead::Verdict;
    std::size_t room = suppress ? std::numeric_limits<int>::max() : result.getFreeRoom();
    if (width > 0) room = std::min(room, static_cast<std::size_t>(width));
    if (room == 0 || (!suppress && result.GetClassID() != vxCHAR_CLASS)) return false;
    if (!asciiAnswersKnown) answerForAscii();
    auto* const begin = suppress ? nullptr : static_cast<char16_t*>(result.Allocate(room));
    std::size_t taken = 0;
    const bool ended = detail::UnitsAhead(input).takeWhile([&](char16_t unit) {
        if (!(unit < asciiAnswers.size() ? asciiAnswers[unit] : accepts(unit)))
            return Verdict::GiveBack;
        if (begin) begin[taken] = unit;
        return ++taken == room ? Verdict::TakeLast : Verdict::Take;
    });
    if (begin) result.SetLastChunkSize(taken);
    if (taken != 0) matched = true;
    if (width > 0) width -= static_cast<int>(taken);
    return width == 0 || (ended && taken < room);
}

void finFormatPieceCMATCH::answerForAscii() {
    for (char16_t unit = 0; unit < asciiAnswers.size(); ++unit)
        asciiAnswers[unit] = accepts(unit);
    asciiAnswersKnown = true;
}
#endif

// Where a range could begin with a "-" or behind another range, it does: only a "-" directly before
// the closing bracket ends no range.
bool finFormatPieceCMATCH::accepts(char16_t character) const {
    const char16_t* at = getText().data() + open + 1;
    const bool negated = *at == u'^';
    if (negated) ++at;
    do {
        const char32_t first = nextCodePoint(at);
        char32_t last = first;
        if (at[0] == u'-' && at[1] != u']') last = nextCodePoint(++at);
        const auto [low, high] = std::minmax(first, last);
        if (character >= low && character <= high) return !negated;
    } while (*at != u']');
    return negated;
}

finFormatPieceLiteral::finFormatPieceLiteral(const finFormatPieceInitBlock& init,
                                             TcodnStream* readFrom)
    : finFormatPieceOfText(init), source(readFrom) {}

unsigned long finFormatPieceLiteral::scan(TcodnStream& /*input*/, OutputBuffer& /*result*/,
                                          bool /*hostFlag*/, bool& failed, int& status) {
    const std::u16string_view wanted = getText();
    for (std::size_t i = 0; i < wanted.size();) {
        if (qzu_isbreakablespace(wanted[i])) {
            source->SkipWhiteSpace();
            ++i;
            continue;
        }
        // The character behind a "%" is not looked at; this is on purpose.
        const std::size_t next = i + (wanted[i] == u'%' ? 2 : 1);
        const char16_t unit = wanted[std::exchange(i, next)];
#ifdef FILEIO_FAST_PATHS
        if (takeEqual(unit)) continue;
#endif
        std::size_t bytes = 0;
        if (source->GetNCodePoints(oneChar, 1, &bytes) == 0) return fail(0, failed, status);
        if (oneChar.front() != unit) {
            source->giveBack(oneChar.front(), bytes);
            return fail(code::MatchingFailure, failed, status);
        }
    }
    return 0;
}

#ifdef FILEIO_FAST_PATHS
// Takes the next character when it lies in memory and is the one wanted.
bool finFormatPieceLiteral::takeEqual(char16_t wanted) {
    using Verdict = detail::UnitsAhead::Verdict;
    bool isEqual = false;
    detail::UnitsAhead(*source).takeWhile([&isEqual, wanted](char16_t unit) {
        isEqual = unit == wanted;
        return isEqual ? Verdict::TakeLast : Verdict::GiveBack;
    });
    return isEqual;
}
#endif

finFormatPieceError::finFormatPieceError(const finFormatPieceInitBlock& init, int errorCode)
    : finFormatPieceOfText(init), code(errorCode) {}

unsigned long finFormatPieceError::scan(TcodnStream& /*input*/, OutputBuffer& /*result*/,
                                        bool /*hostFlag*/, bool& failed, int& status) {
    return fail(code, failed, status);
}

}  // namespace Orvandeil::FileIO
