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

struct Raised {
    std::string identifier;
    std::vector<std::string> arguments;
    std::string message;
};

Raised raisedBy(int code) {
    try {
        fiThrowErrMsg(code);
    } catch (const IMsgIDException& error) {
        return {error.GetID(), error.GetBaseMsgIDObj().GetArguments(), error.what()};
    }
}

TEST(ErrorCodes, EveryCodeRaisesItsIdentifier) {
    const std::vector<std::string>& keys = support::codedKeys();
    ASSERT_EQ(keys.size(), 45u);
    for (int code = -1; code >= -45; --code) {
        const Raised raised = raisedBy(code);
        EXPECT_EQ(raised.identifier, "KESTRA:FileIO:" + keys[static_cast<std::size_t>(-1 - code)]);
        EXPECT_TRUE(raised.arguments.empty());
    }
}

TEST(ErrorCodes, OtherNumbersAreTheSystems) {
    for (const int code : {0, 1, ENOENT, 4096, INT_MAX, -46, -1000, INT_MIN}) {
        const Raised raised = raisedBy(code);
        EXPECT_EQ(raised.identifier, "KESTRA:FileIO:Errno");
        EXPECT_EQ(raised.arguments, std::vector<std::string>{std::strerror(code)});
    }
}

TEST(ErrorCodes, MessagesAreThoseRaised) {
    EXPECT_TRUE(fiPkStrerror(0).empty());
    for (int code = -50; code <= 50; ++code) {
        if (code == 0) continue;
        const std::u16string message = fiPkStrerror(code);
        EXPECT_EQ(vxTextToNarrow(message.data(), message.size()), raisedBy(code).message) << code;
    }
}

TEST(ErrorCodes, RaisedTypeIsTheClassOfTheIdentifier) {
    EXPECT_THROW(fiThrowErrMsg(-4), Error<KESTRA::FileIO::EndOfFile>);
    EXPECT_THROW(fiThrowErrMsg(-45), Error<KESTRA::FileIO::InternalError>);
    EXPECT_THROW(fiThrowErrMsg(2), Error<KESTRA::FileIO::Errno>);
}

}  // namespace
