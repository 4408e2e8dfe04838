#include "fileio/host/exception.h"

#include "fileio/errors/identifiers.h"
#include "fileio/host/messages.h"

#include <memory>
#include <typeinfo>

#include <boost/exception/all.hpp>
#include <gtest/gtest.h>

namespace {

using foundation::core::except::Exception;
using foundation::core::except::IMsgIDException;
using BadSize = KESTRA::legacy_two_part::badsize_vx;
using SystemError = KESTRA::FileIO::Errno;
using BadSizeError = Exception<BadSize, std::exception>;
using Place = boost::error_info<struct PlaceTag, int>;

template <class Raise>
boost::exception_ptr stored(Raise raise) {
    try {
        raise();
    } catch (...) {
        return boost::current_exception();
    }
    return {};
}

TEST(Exceptions, StoredErrorsKeepTheirType) {
    const boost::exception_ptr error = stored([] { vxErrMsgId(SystemError("broken")); });
    for (int round = 0; round < 2; ++round) {
        try {
            vxErrorRethrow(error);
        } catch (const Exception<SystemError, std::exception>& again) {
            EXPECT_EQ(typeid(again), typeid(Exception<SystemError, std::exception>));
            EXPECT_EQ(again.GetID(), "KESTRA:FileIO:Errno");
            EXPECT_EQ(again.GetBaseMsgIDObj().GetArguments(), std::vector<std::string>{"broken"});
            EXPECT_NE(std::string(again.what()).find("broken"), std::string::npos);
            continue;
        }
        FAIL() << "the exact type was lost";
    }
}

TEST(Exceptions, CaughtByEveryInterface) {
    EXPECT_THROW(vxErrMsgId(BadSize()), IMsgIDException);
    EXPECT_THROW(vxErrMsgId(BadSize()), boost::exception);
    try {
        vxErrMsgId(BadSize());
    } catch (const std::exception& error) {
        EXPECT_STREQ(error.what(), dynamic_cast<const IMsgIDException&>(error).what());
    }
}

TEST(Exceptions, ClonesAndRethrowsAreOfTheMostDerivedType) {
    const BadSizeError original{BadSize()};
    const IMsgIDException& interface = original;
    const std::unique_ptr<const boost::exception_detail::clone_base> copy(interface.clone());
    EXPECT_NE(dynamic_cast<const BadSizeError*>(copy.get()), nullptr);
    EXPECT_THROW(interface.rethrow(), BadSizeError);
    EXPECT_THROW(copy->rethrow(), BadSizeError);
}

TEST(Exceptions, CopiesShareErrorInfo) {
    BadSizeError original{BadSize()};
    original << Place(7);
    const boost::exception_ptr error = stored([&] { throw original; });
    try {
        vxErrorRethrow(error);
    } catch (const BadSizeError& again) {
        ASSERT_NE(boost::get_error_info<Place>(again), nullptr);
        EXPECT_EQ(boost::get_error_info<Place>(again), boost::get_error_info<Place>(original));
    }
}

TEST(Exceptions, RaisedUnderAnotherIdentifierKeepTheirOwnText) {
    using namespace KESTRA::catalog_class;
    const key_UnableToConvert id("Widget", "double");
    const boost::exception_ptr error = stored([&] { vxErrMsgId(raisedAs, id); });
    try {
        vxErrorRethrow(error);
    } catch (const Exception<key_UnableToConvert, std::exception>& again) {
        EXPECT_EQ(again.GetID(), "KESTRA:UnableToConvert");
        EXPECT_EQ(again.get_error_id(), "KESTRA:UnableToConvert");
        EXPECT_EQ(again.GetBaseMsgIDObj().GetIdentifier(), "KESTRA:class:UnableToConvert");
        const std::u16string text = vxMessageText(id);
        EXPECT_EQ(again.what(), vxTextToNarrow(text.data(), text.size()));
    }
}

}  // namespace
