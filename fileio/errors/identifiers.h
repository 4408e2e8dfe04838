#pragma once

#include "fileio/errors/code_list.h"
#include "fileio/host/message_id.h"

#include <string>

// One class per message identifier, named after its key, in a namespace per component. The
// constructor's arguments fill the catalog's text.

#define FILEIO_PLAIN_IDENTIFIER(componentText, Name)                            \
    class FILEIO_API Name : public ::foundation::core::except::BaseMsgID {      \
    public:                                                                     \
        Name() : ::foundation::core::except::BaseMsgID(componentText, #Name) {} \
    };

#define FILEIO_TEXT_IDENTIFIER(componentText, Name)                                      \
    class FILEIO_API Name : public ::foundation::core::except::BaseMsgID {               \
    public:                                                                              \
        explicit Name(const std::string& argument)                                       \
            : ::foundation::core::except::BaseMsgID(componentText, #Name, {argument}) {} \
    };

namespace KESTRA::FileIO {

#define FILEIO_CODED_IDENTIFIER(number, Name) FILEIO_PLAIN_IDENTIFIER("KESTRA:FileIO", Name)
FILEIO_FOR_EACH_CODE(FILEIO_CODED_IDENTIFIER)
#undef FILEIO_CODED_IDENTIFIER

FILEIO_TEXT_IDENTIFIER("KESTRA:FileIO", Errno)  // the system's text for the error
FILEIO_PLAIN_IDENTIFIER("KESTRA:FileIO", InvalidIntPrecision)
FILEIO_PLAIN_IDENTIFIER("KESTRA:FileIO", InvalidUIntPrecision)
FILEIO_PLAIN_IDENTIFIER("KESTRA:FileIO", sizeMustBeNumeric)

}  // namespace KESTRA::FileIO

namespace KESTRA::legacy_two_part {

FILEIO_PLAIN_IDENTIFIER("KESTRA:legacy_two_part", badpermission_vx)
FILEIO_PLAIN_IDENTIFIER("KESTRA:legacy_two_part", badmachformat_vx)
FILEIO_PLAIN_IDENTIFIER("KESTRA:legacy_two_part", badprecision_vx)
FILEIO_PLAIN_IDENTIFIER("KESTRA:legacy_two_part", badsize_vx)
FILEIO_PLAIN_IDENTIFIER("KESTRA:legacy_two_part", badskip_vx)
FILEIO_PLAIN_IDENTIFIER("KESTRA:legacy_two_part", p64bitsize)
FILEIO_PLAIN_IDENTIFIER("KESTRA:legacy_two_part", notimplemented_vx)

}  // namespace KESTRA::legacy_two_part

namespace KESTRA::fopen {

FILEIO_PLAIN_IDENTIFIER("KESTRA:fopen", IncorrectFileMode)
FILEIO_PLAIN_IDENTIFIER("KESTRA:fopen", ConflictingExclusiveFileModes)

}  // namespace KESTRA::fopen

namespace KESTRA::printf {

FILEIO_PLAIN_IDENTIFIER("KESTRA:printf", OctalCharCodeInvalid)
FILEIO_PLAIN_IDENTIFIER("KESTRA:printf", HexCharCodeInvalid)
FILEIO_PLAIN_IDENTIFIER("KESTRA:printf", OctalCharCodeOutOfRange)
FILEIO_PLAIN_IDENTIFIER("KESTRA:printf", HexCharCodeOutOfRange)
FILEIO_PLAIN_IDENTIFIER("KESTRA:printf", NoControlCharacterInFormat)
FILEIO_TEXT_IDENTIFIER("KESTRA:printf", BadEscapeSequenceInFormat)  // the character after "\"
FILEIO_TEXT_IDENTIFIER("KESTRA:printf", invalidSizeResult)          // the argument's class name

class FILEIO_API UnableToConvertToOneElement : public ::foundation::core::except::BaseMsgID {
public:
    UnableToConvertToOneElement(const char* sourceClass, const char* targetClass)
        : ::foundation::core::except::BaseMsgID("KESTRA:printf", "UnableToConvertToOneElement",
                                                {sourceClass, targetClass}) {}
};

}  // namespace KESTRA::printf

namespace KESTRA::iofun {

FILEIO_TEXT_IDENTIFIER("KESTRA:iofun", UnsupportedEncoding)  // the encoding's name
FILEIO_TEXT_IDENTIFIER("KESTRA:iofun", InvalidEncoding)      // the encoding's name as given

}  // namespace KESTRA::iofun

namespace KESTRA::string {

FILEIO_PLAIN_IDENTIFIER("KESTRA:string", MissingNotSupported)
FILEIO_PLAIN_IDENTIFIER("KESTRA:string", MustBeStringScalarOrCharacterVector)

}  // namespace KESTRA::string

// Both are raised as "KESTRA:UnableToConvert"; only their texts differ.
namespace KESTRA::catalog_class {

inline constexpr char raisedAs[] = "KESTRA:UnableToConvert";

class FILEIO_API key_UnableToConvert : public ::foundation::core::except::BaseMsgID {
public:
    key_UnableToConvert(const char* sourceClass, const char* targetClass)
        : ::foundation::core::except::BaseMsgID("KESTRA:class", "UnableToConvert",
                                                {sourceClass, targetClass}) {}
};

class FILEIO_API key_UnableToConvert2 : public ::foundation::core::except::BaseMsgID {
public:
    key_UnableToConvert2(const char* sourceClass, const char* firstTarget, const char* secondTarget)
        : ::foundation::core::except::BaseMsgID("KESTRA:class", "UnableToConvert2",
                                                {sourceClass, firstTarget, secondTarget}) {}
};

}  // namespace KESTRA::catalog_class

#undef FILEIO_PLAIN_IDENTIFIER
#undef FILEIO_TEXT_IDENTIFIER
