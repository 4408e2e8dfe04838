#include "embedded/builtins/bit_fields.h"

#include <bit>
#include <cstring>

namespace Orvandeil::FileIO::embedded {
namespace {

static_assert(std::endian::native == std::endian::little);

std::uint64_t loadWord(const unsigned char* bytes) {
    std::uint64_t word;
    std::memcpy(&word, bytes, sizeof word);
    return word;
}

void addToWord(unsigned char* bytes, std::uint64_t bits) {
    bits |= loadWord(bytes);
    std::memcpy(bytes, &bits, sizeof bits);
}

}  // namespace

std::uint64_t loadField(const unsigned char* bytes, std::size_t place, const FieldLayout& layout) {
    const unsigned char* const first = bytes + place / 8;
    const std::uint64_t ninth = first[8];
    const int shift = static_cast<int>(place % 8);
    const bool reachesNinth = shift + layout.bits > 64;
    if (layout.bigEndian) {
        std::uint64_t word = __builtin_bswap64(loadWord(first)) << shift;
        if (reachesNinth) word |= ninth >> (8 - shift);
        return word >> (64 - layout.bits);
    }
    std::uint64_t word = loadWord(first) >> shift;
    if (reachesNinth) word |= ninth << (64 - shift);
    return word & highestUnsigned(layout.bits);
}

void storeField(unsigned char* bytes, std::size_t place, const FieldLayout& layout,
                std::uint64_t value) {
    unsigned char* const first = bytes + place / 8;
    const int shift = static_cast<int>(place % 8);
    const bool reachesNinth = shift + layout.bits > 64;
    if (layout.bigEndian) {
        const std::uint64_t word = value << (64 - layout.bits);
        addToWord(first, __builtin_bswap64(word >> shift));
        if (reachesNinth) first[8] |= static_cast<unsigned char>(word << (8 - shift));
        return;
    }
    const std::uint64_t word = value & highestUnsigned(layout.bits);
    addToWord(first, word << shift);
    if (reachesNinth) first[8] |= static_cast<unsigned char>(word >> (64 - shift));
}

unsigned char bitsFrom(unsigned char byte, int place, bool bigEndian) {
    const int mask = bigEndian ? 0xFF >> place : 0xFF << place;
    return static_cast<unsigned char>(byte & mask);
}

}  // namespace Orvandeil::FileIO::embedded
