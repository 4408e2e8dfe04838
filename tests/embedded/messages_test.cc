#include "embedded/services/messages.h"

#include "fileio/errors/identifiers.h"
#include "tests/support/every_identifier.h"
#include "tests/support/printing.h"
#include "tests/support/raised.h"

#include <gtest/gtest.h>

namespace {

using foundation::core::except::BaseMsgID;
using Orvandeil::FileIO::embedded::catalogSentence;
using Orvandeil::FileIO::embedded::WarningRecorder;

std::string messageOf(const BaseMsgID& id) {
    return fileio_tests::toUtf8(vxMessageText(id));
}

TEST(Catalog, HasASentenceForEveryIdentifier) {
    for (const BaseMsgID& id : support::everyIdentifier()) {
        const std::string message = messageOf(id);
        EXPECT_FALSE(catalogSentence(id.GetIdentifier()).empty()) << id.GetIdentifier();
        EXPECT_EQ(message.back(), '.') << message;
        EXPECT_EQ(message.find('{'), std::string::npos) << message;
        for (const std::string& argument : id.GetArguments())
            EXPECT_NE(message.find(argument), std::string::npos) << message;
    }
}

TEST(Catalog, FillsArgumentsAsTheyAre) {
    EXPECT_EQ(messageOf(KESTRA::FileIO::Errno("a {0} {1} \u00e9")),
              "The system reported an error: a {0} {1} \u00e9.");
    EXPECT_EQ(messageOf(KESTRA::catalog_class::key_UnableToConvert2("A", "B", "C")),
              "A value of class A cannot be converted to class B or C.");
    EXPECT_EQ(messageOf(BaseMsgID("KESTRA:some", "thing")), "KESTRA:some:thing");
    EXPECT_EQ(messageOf(BaseMsgID("KESTRA:some", "thing", {"x", "y"})), "KESTRA:some:thing: x, y");
}

TEST(Errors, LegacyNumbers) {
    EXPECT_EQ(fileio_tests::raisedBy([] { vxErrorByNumber(34); }),
              "KESTRA:legacy_two_part:badmachformat_vx");
    EXPECT_EQ(fileio_tests::raisedBy([] { vxErrorByNumber(35); }), "KESTRA:legacy:error35");
}

TEST(Warnings, GoToTheNewestRecorderOrAreShown) {
    const BaseMsgID warnings[] = {{"a", "1"}, {"a", "2"}, {"a", "3"}};
    {
        const WarningRecorder outer;
        vxWarningMsgId(warnings[0]);
        {
            const WarningRecorder inner;
            vxWarningMsgId(warnings[1]);
            EXPECT_EQ(inner.identifiers(), std::vector<std::string>{"a:2"});
        }
        vxWarningMsgId(warnings[2]);
        EXPECT_EQ(outer.identifiers(), (std::vector<std::string>{"a:1", "a:3"}));
    }
    testing::internal::CaptureStderr();
    vxWarningMsgId(KESTRA::iofun::UnsupportedEncoding("X"));
    EXPECT_EQ(testing::internal::GetCapturedStderr(),
              "fileio: warning: KESTRA:iofun:UnsupportedEncoding: "
              "The encoding \"X\" is not supported.\n");
}

}  // namespace
