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

#ifdef FILEIO_FAST_PATHS
// Takes the units of a line that need neither more bytes nor more memory nor the converter, at most
// `limit` unless negative, and the terminator with it if that is clear without reading on. Returns
// their number.
long fileStream::takeOfLine(long limit, OutputBuffer& out, int& result) {
    detail::UnitsAhead ahead(*this);
    const detail::DirectForm form = ahead.form();
    std::size_t room = out.getFreeRoom();
    if (limit > 0) room = std::min(room, static_cast<std::size_t>(limit));
    if (room == 0 || !detail::isAsciiTransparent(form)) return 0;
    const std::string_view bytes = ahead.bytes();
    if (bytes.empty()) return 0;
    const char* const end = bytes.data() + bytes.size();
    auto* const units = static_cast<char16_t*>(out.Allocate(room));
    const Body body = decodeBody(form, bytes, units, room);
    const char* next = bytes.data() + body.decoded.taken;
    std::size_t made = body.decoded.made;
    std::size_t givenBack = 0;
    // The terminator, what follows it, and room for both.
    if (body.isWhole && end - next >= 2 && room - made >= 2) {
        char16_t following = 0;
        givenBack = ahead.decodeUnit(form, next + 1, end, following);
        if (givenBack != 0) result = 1;
        if (*next == carriageReturn && following == lineFeed) result = 2;
        if (result == 2) givenBack = 0;
        for (int i = 0; i < result; ++i)
            units[made++] = static_cast<unsigned char>(*next++);
    }
    out.SetLastChunkSize(made);
    ahead.take(bytes.data(), next, givenBack);
    return static_cast<long>(made);
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
    Rewind(bytes);
    return 1;
}

}  // namespace Orvandeil::FileIO
