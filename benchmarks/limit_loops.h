#pragma once

#include <cstddef>
#include <cstdint>

// The bare loops that limits are made of: no checks, no calls, as wide as the machine has them.
// Blocks do not overlap.
namespace bench {

void widen(const char* from, std::size_t count, char16_t* to);
void narrow(const char16_t* from, std::size_t count, char* to);

// Plain conversions; those to a narrower integer round (halves away from zero) and saturate, and
// know no NaN.
void convert(const std::int16_t* from, std::size_t count, double* to);
void convert(const double* from, std::size_t count, float* to);
void convert(const double* from, std::size_t count, std::int8_t* to);
void convert(const double* from, std::size_t count, std::uint8_t* to);
void convert(const double* from, std::size_t count, std::int16_t* to);
void convert(const double* from, std::size_t count, std::int32_t* to);
void convert(const float* from, std::size_t count, std::int16_t* to);
void convert(const std::int32_t* from, std::size_t count, std::int8_t* to);

void swapBytes(const std::uint16_t* from, std::size_t count, std::uint16_t* to);
void swapBytes(const std::uint64_t* from, std::size_t count, std::uint64_t* to);

// The first of every four.
void everyFourth(const std::uint16_t* from, std::size_t count, std::uint16_t* to);
// Little-endian fields of 12 bits, two in three bytes.
void unpack12(const unsigned char* from, std::size_t pairs, std::uint16_t* to);

}  // namespace bench
