#pragma once

#include "embedded/builtins/bit_fields.h"
#include "fileio/buffers/vector_unit.h"

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <span>
#include <type_traits>

#ifdef FILEIO_VECTOR_UNITS
#include <immintrin.h>

// The fast part of unpacking bit fields: eight at a time. Eight fields begin at the same bit as the
// eight before, `stride` bytes further on, so that one shuffle and one set of shifts serve them
// all.
namespace Orvandeil::FileIO::embedded {

// Where each of eight fields lies from the byte in which the first one begins.
struct FieldVector {
    FieldVector(const FieldLayout& layout, int firstBit)
        : secondHalf((firstBit + 4 * layout.stride) / 8) {
        for (int i = 0; i < 8; ++i) {
            const int bit = firstBit + i * layout.stride - (i < 4 ? 0 : 8 * secondHalf);
            for (int byte = 0; byte < 4; ++byte) {
                const int place = bit / 8 + (layout.bigEndian ? 3 - byte : byte);
                bytes[4 * i + byte] = static_cast<unsigned char>(place);
            }
            shifts[i] = layout.bigEndian ? bit % 8 : 32 - layout.bits - bit % 8;
        }
    }

    int secondHalf;  // the byte in which the fifth field begins
    alignas(32) unsigned char bytes[32];
    alignas(32) int shifts[8];  // bring the highest bit of each field to the top
};

template <class T>
FILEIO_FOR_AVX2 inline void storeNarrowed(__m256i words, T* out) {
    typedef std::uint32_t Words __attribute__((vector_size(32)));
    typedef T Elements __attribute__((vector_size(8 * sizeof(T))));
    const Elements elements = __builtin_convertvector(reinterpret_cast<Words>(words), Elements);
    std::memcpy(out, &elements, sizeof elements);
}

// Returns the fields unpacked: all but some at the end of the bytes, or none when a half of eight
// is too long or the processor too old.
template <class T>
FILEIO_FOR_AVX2 unsigned long unpackVectors(std::span<const unsigned char> bytes, std::size_t place,
                                            const FieldLayout& layout, unsigned long count,
                                            T* out) {
    constexpr int widestField = 25, longestStride = 32;
    constexpr std::ptrdiff_t halfBytes = 16;
    if (layout.bits > widestField || layout.stride > longestStride) return 0;
    const FieldVector fields(layout, static_cast<int>(place % 8));
    const auto shuffle = _mm256_load_si256(reinterpret_cast<const __m256i*>(fields.bytes));
    const auto shifts = _mm256_load_si256(reinterpret_cast<const __m256i*>(fields.shifts));
    const auto back = _mm_cvtsi32_si128(32 - layout.bits);
    const unsigned char* from = bytes.data() + place / 8;
    const unsigned char* const end = bytes.data() + bytes.size();
    unsigned long done = 0;
    for (; done + 8 <= count && end - from >= fields.secondHalf + halfBytes; done += 8) {
        __m256i words =
            _mm256_loadu2_m128i(reinterpret_cast<const __m128i*>(from + fields.secondHalf),
                                reinterpret_cast<const __m128i*>(from));
        words = _mm256_sllv_epi32(_mm256_shuffle_epi8(words, shuffle), shifts);
        words = std::is_signed_v<T> ? _mm256_sra_epi32(words, back) : _mm256_srl_epi32(words, back);
        storeNarrowed(words, out + done);
        from += layout.stride;
    }
    return done;
}

}  // namespace Orvandeil::FileIO::embedded

#endif
