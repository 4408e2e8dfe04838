#include "embedded/services/messages.h"

#include "fileio/errors/identifiers.h"
#include "fileio/host/text.h"
#include "tests/support/every_identifier.h"

#include <gtest/gtest.h>

namespace {

using foundation::core::except::BaseMsgID;
using foundation::core::except::IMsgIDException;
using Orvandeil::FileIO::embedded::catalogSentence;
using Orvandeil::FileIO::embedded::WarningRecorder;

template <class Id>
using Error = foundation::core::except::Exception<Id, std::exception>;

std::string messageOf(const BaseMsgID& id) {
    const std::u16string text = vxMessageText(id);
    return vxTextToNarrow(text.data(), text.size());
}

TEST(Catalog, HasASentenceForEveryIdentifier) {
    for (const BaseMsgID& id : support::everyIdentifier()) {
        const std::string message = messageOf(id);
        EXPECT_FALSE(catalogSentence(id.GetIdentifier()).empty()) << id.GetIdentifier();
        EXPECT_EQ(message.back(), '.') << message;
        EXPECT_EQ(message.find('{'), std::string::npos) << message;
        for (const std::string& argument : id.GetArguments()) {
            EXPECT_NE(message.find(argument), std::string::npos) << message;
        }
    }
}

TEST(Catalog, FillsArgumentsAsTheyAre) {
    EXPECT_EQ(messageOf(KESTRA::FileIO::Errno("a {0} {1} \u00e9")),
              "The system reported an error: a {0} {1} \u00e9.");
    EXPECT_EQ(messageOf(KESTRA::catalog_class::key_UnableToConvert2("A", "B", "C")),
              "A value of class A cannot be converted to class B or C.");
}

TEST(Catalog, UnknownIdentifierTellsItselfAndItsArguments) {
    EXPECT_EQ(messageOf(BaseMsgID("KESTRA:some", "thing")), "KESTRA:some:thing");
    EXPECT_EQ(messageOf(BaseMsgID("KESTRA:some", "thing", {"x", "y"})), "KESTRA:some:thing: x, y");
}

TEST(Errors, LegacyNumbers) {
    using BadMachineFormat = KESTRA::legacy_two_part::badmachformat_vx;
    EXPECT_THROW(vxErrorByNumber(34), Error<BadMachineFormat>);
    try {
        vxErrorByNumber(35);
    } catch (const IMsgIDException& error) {
        EXPECT_EQ(error.GetID(), "KESTRA:legacy:error35");
    }
}

TEST(Warnings, RecordedInOrderByTheNewestRecorder) {
    WarningRecorder outer;
    vxWarningMsgId(BaseMsgID("a", "1"));
    {
        WarningRecorder inner;
        vxWarningMsgId(BaseMsgID("a", "2"));
        EXPECT_EQ(inner.identifiers(), std::vector<std::string>{"a:2"});
    }
    vxWarningMsgId(BaseMsgID("a", "3"));
    EXPECT_EQ(outer.identifiers(), (std::vector<std::string>{"a:1", "a:3"}));
}

TEST(Warnings, PrintedAtOnceOtherwise) {
    testing::internal::CaptureStderr();
    vxWarningMsgId(KESTRA::iofun::UnsupportedEncoding("X"));
    EXPECT_EQ(testing::internal::GetCapturedStderr(),
              "fileio: warning: KESTRA:iofun:UnsupportedEncoding: "
              "The encoding \"X\" is not supported.\n");
}

}  // namespace
