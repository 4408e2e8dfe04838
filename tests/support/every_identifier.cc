#include "tests/support/every_identifier.h"

#include "fileio/errors/identifiers.h"

namespace support {

using foundation::core::except::BaseMsgID;

const std::vector<std::string>& codedKeys() {
    static const std::vector<std::string> keys = {"NoHelp",
                                                  "CannotOpenFile",
                                                  "IsOpenRead",
                                                  "EndOfFile",
                                                  "IsOpenWrite",
                                                  "NoSpace",
                                                  "FlushError",
                                                  "InvalidFormat",
                                                  "MatchingFailure",
                                                  "SizeTooBig",
                                                  "NoMemory",
                                                  "NoMemoryForString",
                                                  "NotEnoughArgs",
                                                  "UnsupportedDirective",
                                                  "BadWidthNaN",
                                                  "BadWidthNegInf",
                                                  "BadWidthInf",
                                                  "BadWidthInt",
                                                  "BadWidthEmptyArg",
                                                  "BadPrecisionNaN",
                                                  "BadPrecisionNegInf",
                                                  "BadPrecisionInf",
                                                  "BadPrecisionInt",
                                                  "BadPrecisionEmptyArg",
                                                  "BadOffsetNaN",
                                                  "BadOffsetBeforeBegin",
                                                  "BadOffsetAfterEnd",
                                                  "BadOffsetInt",
                                                  "EmptyArg",
                                                  "UngetcFailed",
                                                  "WriteCarryByteFailed",
                                                  "RequireBinaryFile",
                                                  "FseekFailed",
                                                  "ReadFailed",
                                                  "FseekFailedNegOne",
                                                  "FseekFailedSkip",
                                                  "InvalidChar",
                                                  "TruncatedChar",
                                                  "IllegalChar",
                                                  "InvalidTableFormat",
                                                  "BufferOverflow",
                                                  "UnknownError",
                                                  "NonScalarNumbered",
                                                  "NumberedMoreThanArgc",
                                                  "InternalError"};
    return keys;
}

std::vector<BaseMsgID> everyIdentifier() {
    namespace catalog = KESTRA::catalog_class;
    std::vector<BaseMsgID> all = {
        KESTRA::FileIO::Errno("first"),
        KESTRA::FileIO::InvalidIntPrecision(),
        KESTRA::FileIO::InvalidUIntPrecision(),
        KESTRA::FileIO::sizeMustBeNumeric(),
        KESTRA::legacy_two_part::badpermission_vx(),
        KESTRA::legacy_two_part::badmachformat_vx(),
        KESTRA::legacy_two_part::badprecision_vx(),
        KESTRA::legacy_two_part::badsize_vx(),
        KESTRA::legacy_two_part::badskip_vx(),
        KESTRA::legacy_two_part::p64bitsize(),
        KESTRA::legacy_two_part::notimplemented_vx(),
        KESTRA::fopen::IncorrectFileMode(),
        KESTRA::fopen::ConflictingExclusiveFileModes(),
        KESTRA::printf::UnableToConvertToOneElement("first", "second"),
        KESTRA::printf::invalidSizeResult("first"),
        KESTRA::printf::BadEscapeSequenceInFormat("first"),
        KESTRA::printf::OctalCharCodeInvalid(),
        KESTRA::printf::HexCharCodeInvalid(),
        KESTRA::printf::OctalCharCodeOutOfRange(),
        KESTRA::printf::HexCharCodeOutOfRange(),
        KESTRA::printf::NoControlCharacterInFormat(),
        KESTRA::iofun::UnsupportedEncoding("first"),
        KESTRA::iofun::InvalidEncoding("first"),
        KESTRA::string::MissingNotSupported(),
        KESTRA::string::MustBeStringScalarOrCharacterVector(),
        catalog::key_UnableToConvert("first", "second"),
        catalog::key_UnableToConvert2("first", "second", "third"),
    };
    for (const std::string& key : codedKeys())
        all.emplace_back("KESTRA:FileIO", key);
    return all;
}

}  // namespace support
