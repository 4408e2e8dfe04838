#include "fileio/streams/file_stream.h"
#include "fileio/text/mixed_utf8.h"
#include "fileio/text/units_ahead.h"

#include <algorithm>
#include <cstring>
#include <string_view>

namespace Orvandeil::FileIO {
namespace {

constexpr char16_t lineFeed = u'\n';
constexpr char16_t carriageReturn = u'\r';

void append(OutputBuffer& out, char16_t unit) {
    std::size_t room = 1;
    *static_cast<char16_t*>(out.Allocate(room)) = unit;
}

#ifdef FILEIO_FAST_PATHS
// The bytes before the first line feed or carriage return, if there is any.
std::size_t lengthOfBody(std::string_view bytes) {
    const void* const feed = std::memchr(bytes.data(), lineFeed, bytes.size());
    if (feed) bytes = {bytes.data(), static_cast<const char*>(feed)};
    const void* const carriage = std::memchr(bytes.data(), carriageReturn, bytes.size());
    if (carriage) bytes = {bytes.data(), static_cast<const char*>(carriage)};
    return bytes.size();
}

struct Body {
    detail::Progress decoded;
    bool isWhole;  // a terminator follows
};

Body decodeBody(detail::DirectForm form, std::string_view bytes, char16_t* units,
                std::size_t room) {
    detail::Progress done{0, 0};
    if (form == detail::DirectForm::Utf8) {
        done = detail::decodeMixedUtf8Line(bytes.data(), bytes.size(), units, room);
        bytes.remove_prefix(done.taken);
        const bool atEnd = !bytes.empty() && (bytes[0] == lineFeed || bytes[0] == carriageReturn);
        if (atEnd) return {done, true};
    }
    const std::size_t body = lengthOfBody(bytes);
    const detail::Progress rest = detail::decodeDirectly(form, nullptr, bytes.data(), body,
                                                         units + done.made, room - done.made);
    const bool isWhole = rest.taken == body && body != bytes.size();
    return {{done.taken + rest.taken, done.made + rest.made}, isWhole};
}

// What lies ahead of a line, and how the line ended there: 0 when that takes reading on.
struct LineStart {
    std::size_t units;
    const char* next;
    std::size_t givenBack = 0;
    int result = 0;
};

LineStart decodeLine(const detail::UnitsAhead& ahead, detail::DirectForm form,
                     std::string_view bytes, char16_t* units, std::size_t room) {
    const Body body = decodeBody(form, bytes, units, room);
    LineStart line = {body.decoded.made, bytes.data() + body.decoded.taken};
    const char* const end = bytes.data() + bytes.size();
    // The terminator, what follows it, and room for both.
    if (!body.isWhole || end - line.next < 2 || room - line.units < 2) return line;
    char16_t following = 0;
    line.givenBack = ahead.decodeUnit(form, line.next + 1, end, following);
    if (line.givenBack != 0) line.result = 1;
    if (*line.next == carriageReturn && following == lineFeed) line.result = 2;
    if (line.result == 2) line.givenBack = 0;
    for (int i = 0; i < line.result; ++i)
        units[line.units++] = static_cast<unsigned char>(*line.next++);
    return line;
}
#endif

}  // namespace

int fileStream::GetLine(long maxCharacters, OutputBuffer& out) {
    constexpr long noLimit = -1;
    if (maxCharacters < 1 && maxCharacters != noLimit) return 0;
    int result = 0;
    long count = 0;
    char16_t unit = 0;
    const auto isWanting = [&] { return result == 0 && count != maxCharacters; };
    while (isWanting()) {
#ifdef FILEIO_FAST_PATHS
        count += takeOfLine(maxCharacters - count, out, result);
        if (!isWanting()) break;
#endif
        if (GetNCodePoints(&unit, 1, nullptr) == 0) break;
        append(out, unit);
        ++count;
        if (unit != lineFeed && unit != carriageReturn) continue;
        result = count == maxCharacters ? 1 : completeTerminator(unit, out);
    }
    if (count != 0 && detail::bytesReadAhead(file).empty()) checkForEndOfFile();
    return result;
}

std::size_t fileStream::takeLineAhead(char16_t* units, std::size_t room, int& result) {
#ifdef FILEIO_FAST_PATHS
    detail::UnitsAhead ahead(*this);
    const std::string_view bytes = ahead.bytes();
    const detail::DirectForm form = ahead.form();
    if (bytes.empty() || !detail::isAsciiTransparent(form)) return 0;
    const LineStart line = decodeLine(ahead, form, bytes, units, room);
    // The end of what was read ahead may be that of the file, which has to be looked for.
    if (line.result == 0 || line.next == bytes.data() + bytes.size()) return 0;
    ahead.take(bytes.data(), line.next, line.givenBack);
    result = line.result;
    return line.units;
#else
    static_cast<void>(units), static_cast<void>(room), static_cast<void>(result);
    return 0;
#endif
}

#ifdef FILEIO_FAST_PATHS
// Takes the units of a line that need neither more bytes nor more memory nor the converter, at most
// `limit` unless negative, and the terminator with it if that is clear without reading on. Returns
// their number.
long fileStream::takeOfLine(long limit, OutputBuffer& out, int& result) {
    detail::UnitsAhead ahead(*this);
    std::size_t room = out.getFreeRoom();
    if (limit > 0) room = std::min(room, static_cast<std::size_t>(limit));
    const std::string_view bytes = ahead.bytes();
    const detail::DirectForm form = ahead.form();
    if (room == 0 || bytes.empty() || !detail::isAsciiTransparent(form)) return 0;
    auto* const units = static_cast<char16_t*>(out.Allocate(room));
    const LineStart line = decodeLine(ahead, form, bytes, units, room);
    out.SetLastChunkSize(line.units);
    ahead.take(bytes.data(), line.next, line.givenBack);
    result = line.result;
    return static_cast<long>(line.units);
}
#endif

// Reads what follows a terminator: the second half of a pair stays, anything else goes back.
int fileStream::completeTerminator(char16_t terminator, OutputBuffer& out) {
    char16_t next = 0;
    std::size_t bytes = 0;
    if (GetNCodePoints(&next, 1, &bytes) == 0) return 1;
    if (terminator == carriageReturn && next == lineFeed) {
        append(out, next);
        return 2;
    }
    giveBack(next, bytes);
    return 1;
}

}  // namespace Orvandeil::FileIO
