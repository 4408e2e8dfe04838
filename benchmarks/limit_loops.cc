#include "benchmarks/limit_loops.h"

#include <algorithm>
#include <cmath>
#include <limits>

#ifdef __clang__
#define WIDE_LOOP
#else
#define WIDE_LOOP __attribute__((target_clones("avx2", "default")))
#endif

namespace bench {
namespace {

template <class To, class From>
__attribute__((always_inline)) inline To roundedInto(From value) {
    constexpr From low = std::numeric_limits<To>::min();
    constexpr From high = static_cast<From>(std::numeric_limits<To>::max());
    const From inside = std::min(std::max(value, low), high);
    return static_cast<To>(
        static_cast<std::int32_t>(inside + std::copysign(static_cast<From>(0.5), inside)));
}

// Without the conversion by way of a rounded value that might leave the range.
template <>
__attribute__((always_inline)) inline std::int32_t roundedInto(double value) {
    const double moved = value + std::copysign(0.5, value);
    return static_cast<std::int32_t>(std::min(std::max(moved, -0x1p31), 0x1p31 - 1));
}

}  // namespace

WIDE_LOOP void widen(const char* __restrict from, std::size_t count, char16_t* __restrict to) {
    for (std::size_t i = 0; i < count; ++i)
        to[i] = static_cast<unsigned char>(from[i]);
}

WIDE_LOOP void narrow(const char16_t* __restrict from, std::size_t count, char* __restrict to) {
    for (std::size_t i = 0; i < count; ++i)
        to[i] = static_cast<char>(from[i]);
}

WIDE_LOOP void convert(const std::int16_t* __restrict from, std::size_t count,
                       double* __restrict to) {
    for (std::size_t i = 0; i < count; ++i)
        to[i] = from[i];
}

WIDE_LOOP void convert(const double* __restrict from, std::size_t count, float* __restrict to) {
    for (std::size_t i = 0; i < count; ++i)
        to[i] = static_cast<float>(from[i]);
}

WIDE_LOOP void convert(const double* __restrict from, std::size_t count,
                       std::int8_t* __restrict to) {
    for (std::size_t i = 0; i < count; ++i)
        to[i] = roundedInto<std::int8_t>(from[i]);
}

WIDE_LOOP void convert(const double* __restrict from, std::size_t count,
                       std::uint8_t* __restrict to) {
    for (std::size_t i = 0; i < count; ++i)
        to[i] = roundedInto<std::uint8_t>(from[i]);
}

WIDE_LOOP void convert(const double* __restrict from, std::size_t count,
                       std::int16_t* __restrict to) {
    for (std::size_t i = 0; i < count; ++i)
        to[i] = roundedInto<std::int16_t>(from[i]);
}

WIDE_LOOP void convert(const double* __restrict from, std::size_t count,
                       std::int32_t* __restrict to) {
    for (std::size_t i = 0; i < count; ++i)
        to[i] = roundedInto<std::int32_t>(from[i]);
}

WIDE_LOOP void convert(const float* __restrict from, std::size_t count,
                       std::int16_t* __restrict to) {
    for (std::size_t i = 0; i < count; ++i)
        to[i] = roundedInto<std::int16_t>(from[i]);
}

WIDE_LOOP void convert(const std::int32_t* __restrict from, std::size_t count,
                       std::int8_t* __restrict to) {
    for (std::size_t i = 0; i < count; ++i)
        to[i] = static_cast<std::int8_t>(std::min(std::max(from[i], -128), 127));
}

WIDE_LOOP void swapBytes(const std::uint16_t* __restrict from, std::size_t count,
                         std::uint16_t* __restrict to) {
    for (std::size_t i = 0; i < count; ++i)
        to[i] = __builtin_bswap16(from[i]);
}

WIDE_LOOP void swapBytes(const std::uint64_t* __restrict from, std::size_t count,
                         std::uint64_t* __restrict to) {
    for (std::size_t i = 0; i < count; ++i)
        to[i] = __builtin_bswap64(from[i]);
}

WIDE_LOOP void everyFourth(const std::uint16_t* __restrict from, std::size_t count,
                           std::uint16_t* __restrict to) {
    for (std::size_t i = 0; i < count; ++i)
        to[i] = from[4 * i];
}

WIDE_LOOP void unpack12(const unsigned char* __restrict from, std::size_t pairs,
                        std::uint16_t* __restrict to) {
    for (std::size_t i = 0; i < pairs; ++i) {
        const int bits = from[3 * i] | from[3 * i + 1] << 8 | from[3 * i + 2] << 16;
        to[2 * i] = static_cast<std::uint16_t>(bits & 0xFFF);
        to[2 * i + 1] = static_cast<std::uint16_t>(bits >> 12);
    }
}

}  // namespace bench
