#pragma once

// Loops over many elements are compiled once for every processor and again for newer ones, whose
// vectors are wider; which of them runs is decided by the processor at hand.
namespace Orvandeil::FileIO::detail {

#if defined(FILEIO_FAST_PATHS) && defined(__x86_64__)
#define FILEIO_VECTOR_UNITS
#define FILEIO_FOR_AVX2 [[gnu::target("avx2")]]
#define FILEIO_FOR_AVX512 [[gnu::target("avx512f,avx512bw,avx512dq,avx512vl")]]

inline bool hasAvx2() {
    return __builtin_cpu_supports("avx2");
}
inline bool hasAvx512() {
    return __builtin_cpu_supports("avx512bw") && __builtin_cpu_supports("avx512dq") &&
           __builtin_cpu_supports("avx512vl");
}
#endif

}  // namespace Orvandeil::FileIO::detail
