#pragma once

#include <bit>
#include <cstdint>
#include <cstring>

// Digits by words instead of one by one. The first digit is the lowest byte of a word.
namespace Orvandeil::FileIO::detail {

using Word128 = unsigned __int128;

inline constexpr std::uint64_t eightZeros = 0x3030303030303030;
inline constexpr Word128 sixteenZeros = Word128{eightZeros} << 64 | eightZeros;
inline constexpr std::uint64_t tenTo8 = 100000000;
inline constexpr std::uint64_t tenTo16 = tenTo8 * tenTo8;

// The eight digits of n < 10^8 as numbers 0 to 9. Each step splits every lane into two, by
// multiplications that are exact for the lane's range.
constexpr std::uint64_t eightDigits(std::uint64_t n) {
    std::uint64_t lanes = n / 10000 | n % 10000 << 32;
    const std::uint64_t hundreds = (lanes * 10486 >> 20) & 0x0000007f0000007f;
    lanes = hundreds | (lanes - 100 * hundreds) << 16;
    const std::uint64_t tens = (lanes * 103 >> 10) & 0x000f000f000f000f;
    return tens | (lanes - 10 * tens) << 8;
}

// The sixteen digits of n < 10^16.
constexpr Word128 sixteenDigits(std::uint64_t n) {
    return Word128{eightDigits(n % tenTo8)} << 64 | eightDigits(n / tenTo8);
}

// The zero bytes in front of the first other one; 8 and 16 when there is none.
constexpr int leadingZeroBytes(std::uint64_t word) {
    return std::countr_zero(word) / 8;
}
constexpr int leadingZeroBytes(Word128 words) {
    const auto first = static_cast<std::uint64_t>(words);
    return first != 0 ? leadingZeroBytes(first)
                      : 8 + leadingZeroBytes(static_cast<std::uint64_t>(words >> 64));
}

// The bytes up to the last that is not zero.
constexpr int significantBytes(Word128 words) {
    const auto second = static_cast<std::uint64_t>(words >> 64);
    return second != 0 ? 16 - std::countl_zero(second) / 8
                       : 8 - std::countl_zero(static_cast<std::uint64_t>(words)) / 8;
}

inline void storeBytes(char* out, std::uint64_t word) {
    if constexpr (std::endian::native == std::endian::big) word = __builtin_bswap64(word);
    std::memcpy(out, &word, sizeof word);
}
inline void storeBytes(char* out, Word128 words) {
    storeBytes(out, static_cast<std::uint64_t>(words));
    storeBytes(out + 8, static_cast<std::uint64_t>(words >> 64));
}

}  // namespace Orvandeil::FileIO::detail
