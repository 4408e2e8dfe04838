#include "fileio/constants.h"
#include "fileio/streams/file_stream.h"
#include "fileio/text/conversion_size_error.h"
#include "fileio/text/direct_transcoding.h"
#include "fileio/text/input_string_stream.h"
#include "fileio/text/owned_converter.h"
#include "fileio/text/tcodn_stream.h"
#include "fileio/text/units_ahead.h"

#include <algorithm>
#include <typeinfo>
#include <utility>

#include <unicode/utf16.h>

namespace Orvandeil::FileIO {

// What one read brought in and no unit has been made of yet; it lies in readBytes.
struct TcodnStream::Undecoded {
    const char* next = nullptr;
    std::size_t count = 0;
    std::size_t bytesRead = 0;
    bool endOfData = false;
    bool exhausted = false;  // the last round neither took a byte nor made a unit

    void drop(std::size_t bytes) {
        next += bytes;
        count -= bytes;
    }
};

namespace {

constexpr unsigned long largestRead = 2147483647;
constexpr std::size_t largestConversion = 0x3FFFFFFD;

#ifdef FILEIO_FAST_PATHS
// What the converter gets of a text that needs it only here and there.
constexpr std::size_t smallestConversion = 128;
#endif

// Makes one unit, if there is one, of what the converter holds. At the end of the text an
// incomplete character is one, too.
UErrorCode takeHeldUnit(UConverter* converter, bool atEnd, char16_t*& target) {
    const char* nothing = "";
    UErrorCode status = U_ZERO_ERROR;
    ucnv_toUnicode(converter, &target, target + 1, &nothing, nothing, nullptr, atEnd, &status);
    return status;
}

// Whether the converter keeps bytes or units back for its next call. A full target may mean no more
// than that the source was longer. In an encoding without state a copy can be asked: what there is
// shows at the end of the text.
bool holdsBack(const UConverter* converter, UErrorCode status, bool hasState) {
    UErrorCode failure = U_ZERO_ERROR;
    if (ucnv_toUCountPending(converter, &failure) != 0) return true;
    if (status != U_BUFFER_OVERFLOW_ERROR || hasState) return status == U_BUFFER_OVERFLOW_ERROR;
    const detail::OwnedConverter copy(ucnv_clone(converter, &failure));
    if (U_FAILURE(failure)) return true;
    char16_t unit;
    char16_t* target = &unit;
    takeHeldUnit(copy.get(), true, target);
    return target != &unit;
}

// Each pair becomes the one unit U+001A. So does a high surrogate without its partner; a low one
// disappears.
unsigned long replacePairs(char16_t* units, unsigned long count) {
    char16_t* const end =
        std::remove_if(units, units + count, [](char16_t unit) { return U16_IS_TRAIL(unit); });
    std::replace_if(
        units, end, [](char16_t unit) { return U16_IS_LEAD(unit); }, u'\u001A');
    return static_cast<unsigned long>(end - units);
}

// Takes the second half of a pair out of the converter, whose first half filled the target. A
// reset would do so too, but also forget the byte order and the shift state. Returns whether the
// converter still holds something.
bool dropHeldUnit(UConverter* converter, bool hasState) {
    char16_t held;
    char16_t* target = &held;
    return holdsBack(converter, takeHeldUnit(converter, false, target), hasState);
}

}  // namespace

unsigned long TcodnStream::asciiCheck(const char* bytes, unsigned long count) {
    unsigned long i = 0;
#ifdef FILEIO_FAST_PATHS
    i = detail::asciiWithoutNul(bytes, count);
#endif
    for (; i < count; ++i) {
        const auto byte = static_cast<unsigned char>(bytes[i]);
        // A NUL that ends a read is let through on purpose.
        if (byte < 0x80 && (byte != 0 || i + 1 == count)) continue;
        asciiSoFar = false;
        return i;
    }
    return 0;
}

// A long text passes through little memory where neither the converter's state nor who reads can
// tell the difference. Detection can: it is told where in the read the text ceases to be ASCII.
bool TcodnStream::readsInPieces() const {
#ifdef FILEIO_FAST_PATHS
    const std::type_info& type = typeid(*this);
    return directForm != detail::DirectForm::None && !asciiSoFar &&
           (type == typeid(fileStream) || type == typeid(inputStringStream));
#else
    return false;
#endif
}

// One read to the layers above; memory grows with what is really there.
TcodnStream::Undecoded TcodnStream::readUndecoded(unsigned long wanted) {
    wanted = std::min(wanted, readsInPieces() ? constants::decodePieceBytes : largestRead);
    unsigned long piece = 0;
    unsigned long got = 0;
    std::size_t total = 0;
    do {
        piece = std::min(wanted - total, constants::transferPieceBytes);
        if (readBytes.size() < total + piece) readBytes.resize(total + piece);
        got = GetNElements(piece, readBytes.data() + total, 1);
        total += got;
    } while (got == piece && total < wanted);
    return {readBytes.data(), total, total, total == 0, false};
}

unsigned long TcodnStream::GetNCodePoints(char16_t* out, unsigned long n,
                                          std::size_t* bytesConsumed) {
#ifdef FILEIO_FAST_PATHS
    if (n == 1 && detail::UnitsAhead(*this).takeAscii(*out)) {
        if (bytesConsumed) *bytesConsumed = 1;
        return 1;
    }
#endif
    return readUnits(out, n, bytesConsumed);
}

// Apart from one unit taken as it is, which needs nothing on the stack.
[[gnu::noinline]] unsigned long TcodnStream::readUnits(char16_t* out, unsigned long n,
                                                       std::size_t* bytesConsumed) {
    std::size_t unused = 0;
    std::size_t& consumed = bytesConsumed ? *bytesConsumed : unused;
    consumed = 0;
    unsigned long produced = 0;
    begunMidCharacter = midCharacter;
    if (unitGivenBack && n != 0) {
        out[produced++] = *std::exchange(unitGivenBack, std::nullopt);
        midCharacter = converterHolds;
    }
#ifdef FILEIO_FAST_PATHS
    if (produced == 0) produced = detail::UnitsAhead(*this).takeUnits(out, n, consumed);
#endif
    Undecoded bytes;
    while (produced < n && !bytes.exhausted) {
        if (bytes.count == 0) {
            // Never more bytes than units are wanted: one-byte encodings read nothing too far.
            bytes = readUndecoded(n - produced);
            consumed += bytes.count;
        }
        produced += decode(bytes, out + produced, n - produced);
    }
    if (bytes.count != 0 && Rewind(bytes.count)) consumed -= bytes.count;
    return produced;
}

// Bytes that go back are decoded again. That makes the same unit if it was made of them alone, by a
// converter that remembers nothing else.
void TcodnStream::giveBack(char16_t unit, std::size_t bytes) {
    if (bytes == 0 || begunMidCharacter || (converterHolds && hasState())) {
        unitGivenBack = unit;
        midCharacter = true;
        return;
    }
    Rewind(bytes);
    forgetUnread();
}

// Whether what bytes mean depends on those before them, a byte order mark for example.
bool TcodnStream::hasState() const {
    return directForm == detail::DirectForm::None;
}

// Encodings with state keep theirs.
void TcodnStream::forgetUnread() {
    unitGivenBack.reset();
    if (converterHolds && !hasState()) ucnv_resetToUnicode(converter);
    while (converterHolds) {
        char16_t unit;
        char16_t* target = &unit;
        takeHeldUnit(converter, false, target);
        converterHolds = target != &unit;
    }
    midCharacter = false;
}

unsigned long TcodnStream::decode(Undecoded& bytes, char16_t* out, unsigned long room) {
    unsigned long leadingAscii = 0;
    if (asciiSoFar) leadingAscii = asciiCheck(bytes.next, bytes.count);
    if (!asciiSoFar) return convert(bytes, out, room, GetConv(leadingAscii));
    std::copy_n(bytes.next, bytes.count, out);
    bytes.exhausted = bytes.count == 0;
    return std::exchange(bytes.count, 0);
}

#ifdef FILEIO_FAST_PATHS
unsigned long TcodnStream::convertDirectly(Undecoded& bytes, char16_t* out, unsigned long room) {
    if (midCharacter) return 0;
    const detail::Progress progress =
        detail::decodeDirectly(directForm, tableOfConverter(), bytes.next, bytes.count, out, room);
    bytes.drop(progress.taken);
    return progress.made;
}
#endif

unsigned long TcodnStream::convert(Undecoded& bytes, char16_t* out, unsigned long room,
                                   UConverter* from) {
    std::size_t mostBytes = constants::converterPieceBytes;
#ifdef FILEIO_FAST_PATHS
    if (directForm != detail::DirectForm::None) {
        if (const unsigned long units = convertDirectly(bytes, out, room)) return units;
        mostBytes = std::min(mostBytes, smallestConversion);
    }
#endif
    const char* source = bytes.next;
    const char* const sourceEnd = source + std::min(bytes.count, mostBytes);
    char16_t* target = out;
    const char16_t* const targetEnd = out + std::min(room, constants::converterPieceBytes);
    UErrorCode status = U_ZERO_ERROR;
    ucnv_toUnicode(from, &target, targetEnd, &source, sourceEnd, nullptr, bytes.endOfData, &status);
    midCharacter = converterHolds = holdsBack(from, status, hasState());
    // A full target is how a round ends, and no failure.
    if (status == U_BUFFER_OVERFLOW_ERROR && target == targetEnd) status = U_ZERO_ERROR;
    if (U_FAILURE(status) && bytes.bytesRead > largestConversion) throw ConversionSizeError();

    bytes.exhausted = target == out && source == bytes.next;
    bytes.drop(static_cast<std::size_t>(source - bytes.next));
    auto units = static_cast<unsigned long>(target - out);
    if (units != 0 && U16_IS_LEAD(target[-1]))
        midCharacter = converterHolds = dropHeldUnit(from, hasState());
    if (!latinFixed) units = replacePairs(out, units);
    CheckStatus(status);
    return units;
}

// Decodes up to `room` units (changed to what the buffer granted) into a new run of the buffer.
unsigned long TcodnStream::decodeInto(OutputBuffer& buffer, std::size_t& room,
                                      std::size_t& bytesConsumed) {
    auto* const out = static_cast<char16_t*>(buffer.Allocate(room));
    std::size_t bytes = 0;
    unsigned long units = 0;
    try {
        units = GetNCodePoints(out, room, &bytes);
    } catch (...) {
        buffer.SetLastChunkSize(0);
        throw;
    }
    buffer.SetLastChunkSize(units);
    bytesConsumed += bytes;
    return units;
}

unsigned long TcodnStream::GetNCodePoints(OutputBuffer& buffer, unsigned long n,
                                          std::size_t* bytesConsumed) {
    std::size_t consumed = 0;
    unsigned long total = 0;
    std::size_t room = 0;
    unsigned long units = 0;
    while (total < n && units == room) {
        room = std::min(n - total, constants::transferPieceBytes);
        units = decodeInto(buffer, room, consumed);
        total += units;
    }
    if (bytesConsumed) *bytesConsumed = consumed;
    return total;
}

unsigned long TcodnStream::GetNCodePoints(OutputBuffer& buffer, std::size_t* bytesConsumed) {
    std::size_t consumed = 0;
    std::size_t room = 0;
    unsigned long units = 0;
    do {
        room = buffer.SetCurrentCapacity(0, true);
        units = decodeInto(buffer, room, consumed);
    } while (units == room);
    if (bytesConsumed) *bytesConsumed = consumed;
    return units;
}

unsigned long TcodnStream::GetNCodePoints(std::u16string& text, unsigned long n,
                                          std::size_t* bytesConsumed) {
    std::size_t consumed = 0;
    unsigned long total = 0;
    do {
        text.resize(total + std::min(n - total, constants::transferPieceBytes));
        std::size_t bytes = 0;
        total += GetNCodePoints(text.data() + total, text.size() - total, &bytes);
        consumed += bytes;
    } while (total == text.size() && total < n);
    text.resize(total);
    if (bytesConsumed) *bytesConsumed = consumed;
    return total;
}

}  // namespace Orvandeil::FileIO
