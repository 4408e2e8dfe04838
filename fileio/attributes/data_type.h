#pragma once

// Data-type codes: the element types that a precision can name. Their classes and element sizes
// are told by fiPkGetClassIDFromType and fiPkGetSizeFromType.
namespace Orvandeil::FileIO::dataType {

inline constexpr int Logical = 1;
inline constexpr int Char = 2;
inline constexpr int Int8 = 3;
inline constexpr int Int16 = 4;
inline constexpr int Int32 = 5;
inline constexpr int Int64 = 6;
inline constexpr int UInt8 = 7;
inline constexpr int UInt16 = 8;
inline constexpr int UInt32 = 9;
inline constexpr int UInt64 = 10;
inline constexpr int Single = 11;
inline constexpr int Double = 12;
inline constexpr int NoConversion = 13;  // as the other side has it: no class, no size

}  // namespace Orvandeil::FileIO::dataType
