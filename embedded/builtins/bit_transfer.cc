#include "embedded/builtins/bit_transfer.h"

#include "embedded/builtins/unpack_vectors.h"
#include "embedded/services/array.h"
#include "embedded/services/element_types.h"
#include "fileio/constants.h"

#include <algorithm>
#include <cstring>
#include <type_traits>

namespace Orvandeil::FileIO::embedded {
namespace {

template <bool bigEndian>
std::uint64_t loadWord(const unsigned char* bytes) {
    std::uint64_t word;
    std::memcpy(&word, bytes, sizeof word);
    return bigEndian ? __builtin_bswap64(word) : word;
}

// Of fields that a word reaches from any bit.
template <class T, bool bigEndian>
void unpackNarrow(const FieldRun& run, std::size_t place, unsigned long count, T* out) {
    const int left = 64 - run.layout.bits;
    for (unsigned long i = 0; i < count; ++i, place += run.stride()) {
        const std::uint64_t word = loadWord<bigEndian>(run.bytes.data() + place / 8);
        const int shift = static_cast<int>(place % 8);
        // With the highest bit of the field at the top, which extends the sign.
        const std::uint64_t top = word << (bigEndian ? shift : left - shift);
        using Wide = std::conditional_t<std::is_signed_v<T>, std::int64_t, std::uint64_t>;
        out[i] = static_cast<T>(static_cast<Wide>(top) >> left);
    }
}

template <class T>
void unpackWide(const FieldRun& run, std::size_t place, unsigned long count, T* out) {
    for (unsigned long i = 0; i < count; ++i, place += run.stride()) {
        const std::uint64_t field = loadField(run.bytes.data(), place, run.layout);
        if constexpr (std::is_signed_v<T>) {
            out[i] = static_cast<T>(signExtended(field, run.layout.bits));
        } else {
            out[i] = static_cast<T>(field);
        }
    }
}

template <class T>
void unpackFields(const FieldRun& run, std::size_t place, unsigned long count, void* target) {
    constexpr int widestNarrow = 57;
    auto* out = static_cast<T*>(target);
#ifdef FILEIO_VECTOR_UNITS
    if constexpr (sizeof(T) <= sizeof(std::uint32_t)) {
        const unsigned long done =
            detail::hasAvx2 ? unpackVectors(std::span(run.bytes), place, run.layout, count, out)
                            : 0;
        place += done * run.stride();
        count -= done;
        out += done;
    }
#endif
    if (run.layout.bits > widestNarrow) return unpackWide(run, place, count, out);
    if (run.layout.bigEndian) return unpackNarrow<T, true>(run, place, count, out);
    unpackNarrow<T, false>(run, place, count, out);
}

template <class T>
std::uint64_t saturated(T value, int bits) {
    if constexpr (std::is_signed_v<T>) {
        return static_cast<std::uint64_t>(
            std::clamp<std::int64_t>(value, lowestSigned(bits), highestSigned(bits)));
    } else {
        return std::min<std::uint64_t>(value, highestUnsigned(bits));
    }
}

template <class T>
void pack(FieldRun& run, std::size_t place, unsigned long count, const void* source) {
    const auto* const values = static_cast<const T*>(source);
    for (unsigned long i = 0; i < count; ++i, place += run.stride())
        storeField(run.bytes.data(), place, run.layout, saturated(values[i], run.layout.bits));
}

// Calls apply.operator()<T>() with the element type of an integer class.
template <class Apply>
void withIntegerType(vxClassID classID, Apply apply) {
    const auto known = [&apply]<class T>(ElementType<T>) {
        if constexpr (std::is_integral_v<T>) apply.template operator()<T>();
    };
    withElementType(classID, known, [] {});
}

void keepRest(CarryByte& carry, const FieldRun& run, std::size_t end) {
    const auto used = static_cast<int>(end % 8);
    carry.pendingBits = used == 0 ? 0 : 8 - used;
    carry.carryValue = used == 0 ? 0 : bitsFrom(run.bytes[end / 8], used, run.layout.bigEndian);
}

void dropBits(CarryByte& carry) {
    carry.pendingBits = 0;
    carry.carryValue = 0;
}

unsigned long writePiece(OpenFile& file, FieldRun& run, unsigned long count, vxClassID classID,
                         const void* values) {
    CarryByte& carry = file.carry();
    const auto pending = static_cast<unsigned long>(carry.pendingBits);
    std::ranges::fill(run.bytes, 0);
    run.bytes[0] = carry.carryValue;
    withIntegerType(classID, [&]<class T>() { pack<T>(run, pending, count, values); });
    const unsigned long end = pending + count * run.stride();
    const unsigned long whole = end / 8;
    const unsigned long out =
        whole == 0 ? 0 : file.stream->PutNElements(whole, run.bytes.data(), 1);
    if (out < whole) {
        dropBits(carry);
        return 8 * out <= pending ? 0 : (8 * out - pending) / run.stride();
    }
    carry.pendingBits = static_cast<int>(end % 8);
    carry.carryValue = run.bytes[whole];
    return count;
}

// Calls piece(fields done, fields wanted) until `count` fields are done or one comes up short.
template <class Piece>
unsigned long inPieces(unsigned long count, unsigned long atOnce, Piece piece) {
    unsigned long done = 0;
    unsigned long wanted = 0;
    unsigned long moved = 0;
    while (done < count && moved == wanted) {
        wanted = std::min(count - done, atOnce);
        moved = piece(done, wanted);
        done += moved;
    }
    return done;
}

}  // namespace

FieldRun::FieldRun(const FieldLayout& fieldLayout, unsigned long count)
    : layout(fieldLayout),
      fieldsAtOnce(std::min(count, constants::transferPieceBytes * 8 / stride())),
      bytes(1 + (fieldsAtOnce * stride() + 7) / 8 + fieldReach) {}

unsigned long FieldReader::fetch(unsigned long count) {
    CarryByte& carry = file.carry();
    const auto pending = static_cast<unsigned long>(carry.pendingBits);
    const unsigned long bits = count * run.stride();
    const unsigned long needed = bits <= pending ? 0 : (bits - pending + 7) / 8;
    run.bytes[0] = carry.carryValue;
    auto* const rest = reinterpret_cast<char*>(run.bytes.data() + 1);
    const unsigned long got = needed == 0 ? 0 : file.stream->GetNElements(needed, rest, 1);
    fetched = std::min(count, (pending + 8 * got) / run.stride());
    start = 8 - pending;
    if (fetched == count) {
        keepRest(carry, run, start + bits);
    } else {
        dropBits(carry);
    }
    return fetched;
}

void FieldReader::unpack(vxClassID classID, void* target) const {
    withIntegerType(classID, [&]<class T>() { unpackFields<T>(run, start, fetched, target); });
}

unsigned long readFields(OpenFile& file, const FieldLayout& layout, unsigned long count,
                         OutputBuffer& buffer) {
    FieldReader reader(file, layout, count);
    return inPieces(count, reader.fieldsAtOnce(), [&](unsigned long, unsigned long wanted) {
        std::size_t fields = reader.fetch(wanted);
        void* const target = buffer.Allocate(fields);
        reader.unpack(buffer.GetClassID(), target);
        return fields;
    });
}

unsigned long writeFields(OpenFile& file, const FieldLayout& layout, unsigned long count,
                          vxClassID classID, const void* values) {
    FieldRun run(layout, count);
    const std::size_t size = elementBytes(classID);
    return inPieces(count, run.fieldsAtOnce, [&](unsigned long done, unsigned long wanted) {
        const char* const from = static_cast<const char*>(values) + done * size;
        return writePiece(file, run, wanted, classID, from);
    });
}

bool alignFields(OpenFile& file) {
    CarryByte& carry = file.carry();
    const bool settled = carry.WriteCarryByte() == 0;
    if (settled) dropBits(carry);
    return settled;
}

}  // namespace Orvandeil::FileIO::embedded
