#include "fileio/buffers/byte_order.h"

#include "fileio/buffers/vector_unit.h"

#include <cstdint>
#include <cstring>

namespace Orvandeil::FileIO::detail {
namespace {

std::uint16_t reversed(std::uint16_t value) {
    return __builtin_bswap16(value);
}
std::uint32_t reversed(std::uint32_t value) {
    return __builtin_bswap32(value);
}
std::uint64_t reversed(std::uint64_t value) {
    return __builtin_bswap64(value);
}

template <class Unsigned>
[[gnu::always_inline]] inline void flipRun(char* elements, std::size_t count) {
    for (std::size_t i = 0; i < count; ++i) {
        Unsigned value;
        std::memcpy(&value, elements + i * sizeof value, sizeof value);
        value = reversed(value);
        std::memcpy(elements + i * sizeof value, &value, sizeof value);
    }
}

[[gnu::always_inline]] inline void flip(char* elements, std::size_t elementBytes,
                                        std::size_t count) {
    if (elementBytes == 2) flipRun<std::uint16_t>(elements, count);
    if (elementBytes == 4) flipRun<std::uint32_t>(elements, count);
    if (elementBytes == 8) flipRun<std::uint64_t>(elements, count);
}

#ifdef FILEIO_VECTOR_UNITS
FILEIO_FOR_AVX2 void flipOnAvx2(char* elements, std::size_t elementBytes, std::size_t count) {
    flip(elements, elementBytes, count);
}
#endif

}  // namespace

void flipElements(void* elements, std::size_t elementBytes, std::size_t count) {
    auto* const first = static_cast<char*>(elements);
#ifdef FILEIO_VECTOR_UNITS
    if (hasAvx2) return flipOnAvx2(first, elementBytes, count);
#endif
    flip(first, elementBytes, count);
}

}  // namespace Orvandeil::FileIO::detail
