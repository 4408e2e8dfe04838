#include "tests/support/every_identifier.h"

#include <iterator>
#include <sstream>

namespace support {
namespace {

using foundation::core::except::BaseMsgID;

std::vector<std::string> wordsOf(const char* text) {
    std::istringstream in(text);
    return {std::istream_iterator<std::string>(in), {}};
}

}  // namespace

const std::vector<std::string>& codedKeys() {
    static const std::vector<std::string> keys = wordsOf(
        "NoHelp CannotOpenFile IsOpenRead EndOfFile IsOpenWrite NoSpace FlushError InvalidFormat "
        "MatchingFailure SizeTooBig NoMemory NoMemoryForString NotEnoughArgs UnsupportedDirective "
        "BadWidthNaN BadWidthNegInf BadWidthInf BadWidthInt BadWidthEmptyArg BadPrecisionNaN "
        "BadPrecisionNegInf BadPrecisionInf BadPrecisionInt BadPrecisionEmptyArg BadOffsetNaN "
        "BadOffsetBeforeBegin BadOffsetAfterEnd BadOffsetInt EmptyArg UngetcFailed "
        "WriteCarryByteFailed RequireBinaryFile FseekFailed ReadFailed FseekFailedNegOne "
        "FseekFailedSkip InvalidChar TruncatedChar IllegalChar InvalidTableFormat BufferOverflow "
        "UnknownError NonScalarNumbered NumberedMoreThanArgc InternalError");
    return keys;
}

std::vector<BaseMsgID> everyIdentifier() {
    // Components and their keys, each with the number of its arguments if there are any.
    const char* const groups[][2] = {
        {"KESTRA:FileIO", "Errno/1 InvalidIntPrecision InvalidUIntPrecision sizeMustBeNumeric"},
        {"KESTRA:legacy_two_part",
         "badpermission_vx badmachformat_vx badprecision_vx badsize_vx "
         "badskip_vx p64bitsize notimplemented_vx"},
        {"KESTRA:fopen", "IncorrectFileMode ConflictingExclusiveFileModes"},
        {"KESTRA:printf",
         "UnableToConvertToOneElement/2 invalidSizeResult/1 OctalCharCodeInvalid "
         "HexCharCodeInvalid OctalCharCodeOutOfRange HexCharCodeOutOfRange "
         "BadEscapeSequenceInFormat/1 NoControlCharacterInFormat"},
        {"KESTRA:iofun", "UnsupportedEncoding/1 InvalidEncoding/1"},
        {"KESTRA:string", "MissingNotSupported MustBeStringScalarOrCharacterVector"},
        {"KESTRA:class", "UnableToConvert/2 UnableToConvert2/3"},
        {"KESTRA:npy",
         "cannotRead/2 cannotWrite/2 badHeader/2 truncated/2 unsupportedType/2 "
         "unsupportedClass/2"}};
    std::vector<BaseMsgID> all;
    for (const std::string& key : codedKeys())
        all.emplace_back("KESTRA:FileIO", key);
    for (const auto& [component, keys] : groups) {
        for (const std::string& word : wordsOf(keys)) {
            std::vector<std::string> arguments = {"first", "second", "third"};
            const std::size_t end = word.find('/');
            arguments.resize(end == word.npos ? 0 : static_cast<std::size_t>(word[end + 1] - '0'));
            all.emplace_back(component, word.substr(0, end), arguments);
        }
    }
    return all;
}

}  // namespace support
