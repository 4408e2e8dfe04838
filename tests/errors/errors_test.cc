#include "fileio/errors/fi_error.h"
#include "fileio/errors/identifiers.h"
#include "fileio/host/exception.h"
#include "fileio/host/messages.h"
#include "fileio/host/text.h"
#include "tests/support/every_identifier.h"

#include <cerrno>
#include <climits>
#include <cstring>
#include <memory>
#include <typeinfo>

#include <boost/exception/all.hpp>
#include <gtest/gtest.h>

namespace {

template <class Id>
using Error = foundation::core::except::Exception<Id, std::exception>;
using foundation::core::except::IMsgIDException;
using BadSizeError = Error<KESTRA::legacy_two_part::badsize_vx>;
using SystemError = Error<KESTRA::FileIO::Errno>;
using UnableToConvert = KESTRA::catalog_class::key_UnableToConvert;
using Place = boost::error_info<struct PlaceTag, int>;
using Orvandeil::FileIO::fiPkStrerror;
using Orvandeil::FileIO::fiThrowErrMsg;

// Stores what `raise` throws, raises it again and hands it on; it must be an E and nothing derived.
template <class E, class Raise, class Check>
void raiseAgain(Raise raise, Check check) {
    boost::exception_ptr error;
    try {
        raise();
    } catch (...) {
        error = boost::current_exception();
    }
    for (int round = 0; round < 2; ++round) {
        try {
            vxErrorRethrow(error);
        } catch (const E& again) {
            EXPECT_EQ(typeid(again), typeid(E));
            check(again);
        }
    }
}

TEST(Exceptions, StoredErrorsKeepTheirType) {
    const auto raise = [] { vxErrMsgId(KESTRA::FileIO::Errno("broken")); };
    raiseAgain<SystemError>(raise, [](const SystemError& again) {
        EXPECT_EQ(again.GetID(), "KESTRA:FileIO:Errno");
        EXPECT_EQ(again.GetBaseMsgIDObj().GetArguments(), std::vector<std::string>{"broken"});
        EXPECT_NE(std::string(again.what()).find("broken"), std::string::npos);
        const std::exception& standard = again;
        EXPECT_STREQ(standard.what(), again.what());
    });
}

TEST(Exceptions, ClonesAndRethrowsAreOfTheMostDerivedType) {
    const BadSizeError original{KESTRA::legacy_two_part::badsize_vx()};
    const IMsgIDException& interface = original;
    const std::unique_ptr<const boost::exception_detail::clone_base> copy(interface.clone());
    EXPECT_NE(dynamic_cast<const BadSizeError*>(copy.get()), nullptr);
    EXPECT_THROW(interface.rethrow(), BadSizeError);
    EXPECT_THROW(copy->rethrow(), BadSizeError);
    EXPECT_THROW(copy->rethrow(), boost::exception);
}

TEST(Exceptions, CopiesShareErrorInfo) {
    BadSizeError original{KESTRA::legacy_two_part::badsize_vx()};
    original << Place(7);
    raiseAgain<BadSizeError>([&] { throw original; },
                             [&](const BadSizeError& again) {
                                 ASSERT_NE(boost::get_error_info<Place>(again), nullptr);
                                 EXPECT_EQ(boost::get_error_info<Place>(again),
                                           boost::get_error_info<Place>(original));
                             });
}

TEST(Exceptions, RaisedUnderAnotherIdentifierKeepTheirOwnText) {
    const UnableToConvert id("Widget", "double");
    const auto raise = [&] { vxErrMsgId(KESTRA::catalog_class::raisedAs, id); };
    raiseAgain<Error<UnableToConvert>>(raise, [&](const auto& again) {
        EXPECT_EQ(again.GetID(), "KESTRA:UnableToConvert");
        EXPECT_EQ(again.get_error_id(), "KESTRA:UnableToConvert");
        EXPECT_EQ(again.GetBaseMsgIDObj().GetIdentifier(), "KESTRA:class:UnableToConvert");
        const std::u16string text = vxMessageText(id);
        EXPECT_EQ(again.what(), vxTextToNarrow(text.data(), text.size()));
    });
}

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
