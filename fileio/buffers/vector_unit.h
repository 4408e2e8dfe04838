#pragma once

#if defined(FILEIO_FAST_PATHS) && defined(__x86_64__)
#define FILEIO_VECTOR_UNITS
#define FILEIO_FOR_SSSE3 [[gnu::target("ssse3,popcnt")]]
#define FILEIO_FOR_AVX2 [[gnu::target("avx2")]]
#define FILEIO_FOR_AVX512 [[gnu::target("avx512f,avx512bw,avx512dq,avx512vl")]]

// The C library has asked the processor what it can. To have the compiler's support ask again takes
// a tenth of a millisecond on a virtual machine, when the program starts.
#if __has_include(<sys/platform/x86.h>) && !defined(__clang__)  // whose bool it does not know
#include <sys/platform/x86.h>
#define FILEIO_PROCESSOR_HAS(feature, compilersName) CPU_FEATURE_ACTIVE(feature)
#else
#define FILEIO_PROCESSOR_HAS(feature, compilersName) __builtin_cpu_supports(compilersName)
#endif

// Loops over many elements are compiled once for every processor and again for newer ones, whose
// vectors are wider; which of them runs is decided by the processor at hand.
namespace Orvandeil::FileIO::detail {

inline const bool hasSsse3 =
    FILEIO_PROCESSOR_HAS(SSSE3, "ssse3") && FILEIO_PROCESSOR_HAS(POPCNT, "popcnt");
inline const bool hasAvx2 = FILEIO_PROCESSOR_HAS(AVX2, "avx2");
inline const bool hasAvx512 = FILEIO_PROCESSOR_HAS(AVX512BW, "avx512bw") &&
                              FILEIO_PROCESSOR_HAS(AVX512DQ, "avx512dq") &&
                              FILEIO_PROCESSOR_HAS(AVX512VL, "avx512vl");

}  // namespace Orvandeil::FileIO::detail

#undef FILEIO_PROCESSOR_HAS
#endif
