#pragma once

#include <cstddef>
#include <cstdint>

// Bit fields in a run of bytes. Bit i of the run is bit i % 8 of byte i / 8 in little-endian order,
// where a field begins with its lowest bit, and bit 7 - i % 8 of that byte in big-endian order,
// where it begins with its highest: a field of 16 bits on a byte boundary is the 16-bit integer of
// that byte order.
namespace Orvandeil::FileIO::embedded {

struct FieldLayout {
    int bits;        // of the value, 1 to 64
    int stride;      // from one field to the next, `bits` to 64
    bool bigEndian;  // the bit order
};

// Bytes that both functions touch from the one in which a field begins.
inline constexpr std::size_t fieldReach = 9;

// The field that begins at bit `place`, in the low bits of the result.
std::uint64_t loadField(const unsigned char* bytes, std::size_t place, const FieldLayout& layout);

// Puts the low bits of `value` there. The bits of the run must be 0 before.
void storeField(unsigned char* bytes, std::size_t place, const FieldLayout& layout,
                std::uint64_t value);

// The bits of a byte from bit `place` of it on, in the bit order; 8 leaves none.
unsigned char bitsFrom(unsigned char byte, int place, bool bigEndian);

// The ends of a field's range.
constexpr std::int64_t lowestSigned(int bits) {
    return INT64_MIN >> (64 - bits);
}
constexpr std::int64_t highestSigned(int bits) {
    return INT64_MAX >> (64 - bits);
}
constexpr std::uint64_t highestUnsigned(int bits) {
    return UINT64_MAX >> (64 - bits);
}

// A loaded field as a signed number: its highest bit is the sign.
constexpr std::int64_t signExtended(std::uint64_t field, int bits) {
    return static_cast<std::int64_t>(field << (64 - bits)) >> (64 - bits);
}

}  // namespace Orvandeil::FileIO::embedded
