#pragma once

#include <cstddef>

// Sizes that decide where work is cut into pieces. None of them shows in a result; the `small`
// preset shrinks them so that short tests cross every boundary.
namespace Orvandeil::FileIO::constants {

#ifdef FILEIO_SMALL_CONSTANTS
// Bytes moved by one standard-library read or write.
inline constexpr std::size_t transferPieceBytes = 64;
// Bytes of elements that are swapped and converted while they stay in the processor's cache.
inline constexpr std::size_t conversionPieceBytes = 32;
// Bytes of a long text that pass through memory at once.
inline constexpr std::size_t decodePieceBytes = 24;
// Bytes decoded, and UTF-16 bytes encoded, by one converter call.
inline constexpr std::size_t converterPieceBytes = 48;
// First block of a string output stream, in bytes. Callers may rely on it, so it never shrinks.
inline constexpr std::size_t firstOutputBlockBytes = 1024;
// Stack space tried before a formatted number gets a block of its own.
inline constexpr std::size_t numberScratchBytes = 8;
// Block that a longer formatted text passes through.
inline constexpr std::size_t formatPieceBytes = 16;
// Pad characters written at once.
inline constexpr std::size_t paddingBlockUnits = 3;
// The largest chunk, in bytes, that a buffer opens beyond what it was asked for.
inline constexpr std::size_t reservedChunkBytes = 16;
// Formatted elements collected before they are written; below the buffer of any file, so that this
// is written out as it fills, at the same bytes as ever.
inline constexpr std::size_t elementBlockBytes = 1000;
// Elements made ready for that at once.
inline constexpr std::size_t elementSlice = 5;
// Whole numbers taken apart at once.
inline constexpr std::size_t wholeRun = 4;
#else
inline constexpr std::size_t transferPieceBytes = 1048576;
inline constexpr std::size_t conversionPieceBytes = 65536;
inline constexpr std::size_t decodePieceBytes = 65536;
inline constexpr std::size_t converterPieceBytes = 0x3FFFFFFF;
inline constexpr std::size_t firstOutputBlockBytes = 1024;
inline constexpr std::size_t numberScratchBytes = 512;
inline constexpr std::size_t formatPieceBytes = 65536;
inline constexpr std::size_t paddingBlockUnits = 256;
inline constexpr std::size_t reservedChunkBytes = 1048576;
inline constexpr std::size_t elementBlockBytes = 4032;
inline constexpr std::size_t elementSlice = 256;
inline constexpr std::size_t wholeRun = 16;
#endif

}  // namespace Orvandeil::FileIO::constants
