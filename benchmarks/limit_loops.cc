#include "benchmarks/limit_loops.h"

#ifdef __clang__
#define WIDE_LOOP
#else
#define WIDE_LOOP __attribute__((target_clones("avx2", "default")))
#endif

namespace bench {

WIDE_LOOP void widen(const char* __restrict from, std::size_t count, char16_t* __restrict to) {
    for (std::size_t i = 0; i < count; ++i)
        to[i] = static_cast<unsigned char>(from[i]);
}

}  // namespace bench
