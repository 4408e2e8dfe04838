#include "fileio/errors/fi_error.h"

#include "fileio/errors/identifiers.h"
#include "fileio/host/exception.h"
#include "fileio/host/text.h"
#include "tests/support/every_identifier.h"

#include <cerrno>
#include <climits>
#include <cstring>

#include <gtest/gtest.h>

namespace {

template <class Id>
using Error = foundation::core::except::Exception<Id, std::exception>;
using foundation::core::except::IMsgIDException;
using Orvandeil::FileIO::fiPkStrerror;
using Orvandeil::FileIO::fiThrowErrMsg;

// The identifier and the arguments with a bar between; the message is that of the code.
std::string raisedBy(int code) {
    const std::u16string message = fiPkStrerror(code);
    try {
        fiThrowErrMsg(code);
    } catch (const IMsgIDException& error) {
        const std::string text = code == 0 ? "" : error.what();
        EXPECT_EQ(vxTextToNarrow(message.data(), message.size()), text) << code;
        std::string raised = error.GetID();
        for (const std::string& argument : error.GetBaseMsgIDObj().GetArguments())
            raised += '|' + argument;
        return raised;
    }
}

TEST(ErrorCodes, EveryCodeRaisesItsIdentifier) {
    const std::vector<std::string>& keys = support::codedKeys();
    ASSERT_EQ(keys.size(), 45u);
    for (int code = -1; code >= -45; --code)
        EXPECT_EQ(raisedBy(code), "KESTRA:FileIO:" + keys[static_cast<std::size_t>(-1 - code)]);
    EXPECT_THROW(fiThrowErrMsg(-4), Error<KESTRA::FileIO::EndOfFile>);
    EXPECT_THROW(fiThrowErrMsg(-45), Error<KESTRA::FileIO::InternalError>);
    EXPECT_THROW(fiThrowErrMsg(2), Error<KESTRA::FileIO::Errno>);
}

TEST(ErrorCodes, OtherNumbersAreTheSystems) {
    for (const int code : {0, 1, ENOENT, 50, 4096, INT_MAX, -46, -1000, INT_MIN})
        EXPECT_EQ(raisedBy(code), "KESTRA:FileIO:Errno|" + std::string(std::strerror(code)));
}

}  // namespace
