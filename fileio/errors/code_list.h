#pragma once

// The numeric codes that streams and drivers keep for their last failure, one line a code, from
// -1 downwards without a gap. Classes, named constants and the table that raises them are all
// made from this list, and the catalog is checked against it.
//
// FILEIO_FOR_EACH_CODE(apply) expands apply(number, Name) for every line.
// clang-format off
#define FILEIO_FOR_EACH_CODE(apply)  \
    apply(-1, NoHelp)                \
    apply(-2, CannotOpenFile)        \
    apply(-3, IsOpenRead)            \
    apply(-4, EndOfFile)             \
    apply(-5, IsOpenWrite)           \
    apply(-6, NoSpace)               \
    apply(-7, FlushError)            \
    apply(-8, InvalidFormat)         \
    apply(-9, MatchingFailure)       \
    apply(-10, SizeTooBig)           \
    apply(-11, NoMemory)             \
    apply(-12, NoMemoryForString)    \
    apply(-13, NotEnoughArgs)        \
    apply(-14, UnsupportedDirective) \
    apply(-15, BadWidthNaN)          \
    apply(-16, BadWidthNegInf)       \
    apply(-17, BadWidthInf)          \
    apply(-18, BadWidthInt)          \
    apply(-19, BadWidthEmptyArg)     \
    apply(-20, BadPrecisionNaN)      \
    apply(-21, BadPrecisionNegInf)   \
    apply(-22, BadPrecisionInf)      \
    apply(-23, BadPrecisionInt)      \
    apply(-24, BadPrecisionEmptyArg) \
    apply(-25, BadOffsetNaN)         \
    apply(-26, BadOffsetBeforeBegin) \
    apply(-27, BadOffsetAfterEnd)    \
    apply(-28, BadOffsetInt)         \
    apply(-29, EmptyArg)             \
    apply(-30, UngetcFailed)         \
    apply(-31, WriteCarryByteFailed) \
    apply(-32, RequireBinaryFile)    \
    apply(-33, FseekFailed)          \
    apply(-34, ReadFailed)           \
    apply(-35, FseekFailedNegOne)    \
    apply(-36, FseekFailedSkip)      \
    apply(-37, InvalidChar)          \
    apply(-38, TruncatedChar)        \
    apply(-39, IllegalChar)          \
    apply(-40, InvalidTableFormat)   \
    apply(-41, BufferOverflow)       \
    apply(-42, UnknownError)         \
    apply(-43, NonScalarNumbered)    \
    apply(-44, NumberedMoreThanArgc) \
    apply(-45, InternalError)
// clang-format on

namespace Orvandeil::FileIO {

// code::NotEnoughArgs and its like. 0 is success; positive numbers are errno values.
namespace code {
#define FILEIO_DECLARE_CODE(number, Name) inline constexpr int Name = number;
FILEIO_FOR_EACH_CODE(FILEIO_DECLARE_CODE)
#undef FILEIO_DECLARE_CODE
}  // namespace code

#define FILEIO_COUNT_CODE(number, Name) +1
inline constexpr int codeCount = 0 FILEIO_FOR_EACH_CODE(FILEIO_COUNT_CODE);
#undef FILEIO_COUNT_CODE

static_assert(codeCount == 45 && code::InternalError == -codeCount);

}  // namespace Orvandeil::FileIO
