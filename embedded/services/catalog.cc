#include "embedded/services/messages.h"

#include <algorithm>
#include <iterator>
#include <string_view>

namespace Orvandeil::FileIO::embedded {
namespace {

struct Sentence {
    std::string_view identifier;
    std::string_view text;
};

constexpr Sentence sentences[] = {
    {"KESTRA:FileIO:NoHelp", "The operation failed for a reason that the system did not give."},
    {"KESTRA:FileIO:CannotOpenFile", "The file cannot be opened."},
    {"KESTRA:FileIO:IsOpenRead", "The file is open for reading only."},
    {"KESTRA:FileIO:EndOfFile", "The end of the file was reached."},
    {"KESTRA:FileIO:IsOpenWrite", "The file is open for writing only."},
    {"KESTRA:FileIO:NoSpace", "There is no space left to write to."},
    {"KESTRA:FileIO:FlushError", "Buffered data could not be written to the file."},
    {"KESTRA:FileIO:InvalidFormat", "The format is invalid."},
    {"KESTRA:FileIO:MatchingFailure", "The data do not match the format."},
    {"KESTRA:FileIO:SizeTooBig", "The requested size is too big."},
    {"KESTRA:FileIO:NoMemory", "There is not enough memory for the operation."},
    {"KESTRA:FileIO:NoMemoryForString", "There is not enough memory for the text."},
    {"KESTRA:FileIO:NotEnoughArgs", "The format asks for more arguments than were given."},
    {"KESTRA:FileIO:UnsupportedDirective",
     "The format contains a directive that is not supported."},
    {"KESTRA:FileIO:BadWidthNaN", "The field width must not be NaN."},
    {"KESTRA:FileIO:BadWidthNegInf", "The field width must not be negative infinity."},
    {"KESTRA:FileIO:BadWidthInf", "The field width must not be infinite."},
    {"KESTRA:FileIO:BadWidthInt", "The field width does not fit a 32-bit integer."},
    {"KESTRA:FileIO:BadWidthEmptyArg", "The argument for the field width is empty."},
    {"KESTRA:FileIO:BadPrecisionNaN", "The precision must not be NaN."},
    {"KESTRA:FileIO:BadPrecisionNegInf", "The precision must not be negative infinity."},
    {"KESTRA:FileIO:BadPrecisionInf", "The precision must not be infinite."},
    {"KESTRA:FileIO:BadPrecisionInt", "The precision does not fit a 32-bit integer."},
    {"KESTRA:FileIO:BadPrecisionEmptyArg", "The argument for the precision is empty."},
    {"KESTRA:FileIO:BadOffsetNaN", "The offset must not be NaN."},
    {"KESTRA:FileIO:BadOffsetBeforeBegin", "The offset lies before the beginning of the file."},
    {"KESTRA:FileIO:BadOffsetAfterEnd", "The offset lies beyond the end of the file."},
    {"KESTRA:FileIO:BadOffsetInt", "The offset must be an integer."},
    {"KESTRA:FileIO:EmptyArg", "The argument is empty."},
    {"KESTRA:FileIO:UngetcFailed", "A character that was read could not be put back."},
    {"KESTRA:FileIO:WriteCarryByteFailed",
     "The bits left over from the last write could not be written."},
    {"KESTRA:FileIO:RequireBinaryFile", "The operation requires a file opened as binary."},
    {"KESTRA:FileIO:FseekFailed", "The position in the file could not be set."},
    {"KESTRA:FileIO:ReadFailed", "The file could not be read."},
    {"KESTRA:FileIO:FseekFailedNegOne", "The position could not be moved back by one byte."},
    {"KESTRA:FileIO:FseekFailedSkip", "The bytes between two blocks could not be skipped."},
    {"KESTRA:FileIO:InvalidChar", "A character is not valid in the file's encoding."},
    {"KESTRA:FileIO:TruncatedChar", "The data end in the middle of a character."},
    {"KESTRA:FileIO:IllegalChar", "The data contain a byte sequence that is no character."},
    {"KESTRA:FileIO:InvalidTableFormat", "The encoding's conversion table is not valid."},
    {"KESTRA:FileIO:BufferOverflow", "The converted text does not fit its buffer."},
    {"KESTRA:FileIO:UnknownError", "An unknown error occurred in a character conversion."},
    {"KESTRA:FileIO:NonScalarNumbered",
     "An argument that the format names by number must be a scalar."},
    {"KESTRA:FileIO:NumberedMoreThanArgc",
     "The format names an argument by a number beyond the last argument."},
    {"KESTRA:FileIO:InternalError", "An internal error occurred."},
    {"KESTRA:FileIO:Errno", "The system reported an error: {0}."},
    {"KESTRA:FileIO:InvalidIntPrecision",
     "The precision is no integer type; it is taken as a signed bit field, properly \"bitN\"."},
    {"KESTRA:FileIO:InvalidUIntPrecision",
     "The precision is no integer type; it is taken as an unsigned bit field, properly "
     "\"ubitN\"."},
    {"KESTRA:FileIO:sizeMustBeNumeric", "The size must be a real numeric array."},
    {"KESTRA:legacy_two_part:badpermission_vx", "The permission is not valid."},
    {"KESTRA:legacy_two_part:badmachformat_vx", "The machine format is not valid."},
    {"KESTRA:legacy_two_part:badprecision_vx", "The precision is not valid."},
    {"KESTRA:legacy_two_part:badsize_vx", "The size is not valid."},
    {"KESTRA:legacy_two_part:badskip_vx", "The skip must be a whole number of 0 or more."},
    {"KESTRA:legacy_two_part:p64bitsize", "The data are too large for a 64-bit size."},
    {"KESTRA:legacy_two_part:notimplemented_vx", "The operation is not available here."},
    {"KESTRA:fopen:IncorrectFileMode", "The permission contains an unknown mode."},
    {"KESTRA:fopen:ConflictingExclusiveFileModes",
     "The permission contains modes that exclude each other."},
    {"KESTRA:printf:OctalCharCodeInvalid",
     "An octal character code must begin with an octal digit."},
    {"KESTRA:printf:HexCharCodeInvalid",
     "A hexadecimal character code must begin with a hexadecimal digit."},
    {"KESTRA:printf:OctalCharCodeOutOfRange", "An octal character code must not exceed 177777."},
    {"KESTRA:printf:HexCharCodeOutOfRange", "A hexadecimal character code must not exceed FFFF."},
    {"KESTRA:printf:NoControlCharacterInFormat",
     "The format ends in a backslash with no character after it."},
    {"KESTRA:printf:BadEscapeSequenceInFormat",
     "The escape sequence \"\\{0}\" is not valid in a format."},
    {"KESTRA:printf:invalidSizeResult",
     "The size of an object of class {0} must be a double vector of two or more elements."},
    {"KESTRA:printf:UnableToConvertToOneElement",
     "An element of class {0} must convert to exactly one element of class {1}."},
    {"KESTRA:iofun:UnsupportedEncoding", "The encoding \"{0}\" is not supported."},
    {"KESTRA:iofun:InvalidEncoding", "The encoding \"{0}\" is unknown."},
    {"KESTRA:string:MissingNotSupported", "A missing string has no text."},
    {"KESTRA:string:MustBeStringScalarOrCharacterVector",
     "The text must be a string scalar or a character vector."},
    {"KESTRA:class:UnableToConvert", "A value of class {0} cannot be converted to class {1}."},
    {"KESTRA:class:UnableToConvert2",
     "A value of class {0} cannot be converted to class {1} or {2}."},
    {"KESTRA:npy:cannotRead", "The NumPy file \"{0}\" cannot be read: {1}."},
    {"KESTRA:npy:cannotWrite", "The NumPy file \"{0}\" cannot be written: {1}."},
    {"KESTRA:npy:badHeader", "The header of the NumPy file \"{0}\" is not valid: {1}."},
    {"KESTRA:npy:unsupportedType",
     "The NumPy file \"{0}\" holds elements of the unsupported type {1}."},
    {"KESTRA:npy:unsupportedClass", "The NumPy file \"{0}\" cannot hold an array of class {1}."},
    {"KESTRA:npy:truncated", "The NumPy file \"{0}\" ends in its {1}."},
    {"KESTRA:nomem", "There is not enough memory."},
    {"KESTRA:badsubscript", "The index lies outside the array, or is no whole number."},
};

}  // namespace

std::string_view catalogSentence(std::string_view identifier) {
    const auto* found = std::ranges::find(sentences, identifier, &Sentence::identifier);
    return found == std::end(sentences) ? std::string_view() : found->text;
}

}  // namespace Orvandeil::FileIO::embedded
