#include "fileio/attributes/file_permission.h"

#include "tests/support/raised.h"

#include <string>
#include <utility>

#include <gtest/gtest.h>

namespace {

using Orvandeil::FileIO::FilePermission;

// The text kept, the flags as the letters that set them ("rwa+bt", 'f' for automatic flushing), the
// mode for fopen, and the last part of the error.
std::string summary(const FilePermission& p) {
    std::string all = p.text + ':';
    const std::pair<bool, char> flags[] = {{p.read, 'r'},     {p.write, 'w'},  {p.append, 'a'},
                                           {p.update, '+'},   {p.binary, 'b'}, {p.textMode, 't'},
                                           {p.autoFlush, 'f'}};
    for (const auto& [isSet, letter] : flags)
        all += isSet ? std::string(1, letter) : "";
    const std::string error = fileio_tests::raisedBy([&] { p.Validate(); });
    EXPECT_EQ(fileio_tests::raisedBy([&] { p.Validate(); }), error) << "the second time";
    EXPECT_EQ(p.valid, error.empty());
    return all + ' ' + p.fileSystemFormat + (p.valid ? "" : error.substr(error.rfind(':')));
}

std::string summaryOf(const char* mode) {
    FilePermission permission("a+", true);
    permission = mode;
    const FilePermission copy = permission;
    EXPECT_TRUE(copy.constructionFlag);
    EXPECT_EQ(summary(copy), summary(permission));
    return summary(copy);
}

TEST(FilePermission, KeepsErrorsUntilValidated) {
    EXPECT_EQ(summaryOf("rtt"), "rt:rtf rb");
    EXPECT_EQ(summaryOf("W+b"), "W+b:w+b w+b");
    EXPECT_EQ(summaryOf("xr"), "xr:a+f a+b:badpermission_vx");
    EXPECT_EQ(summaryOf("rwx"), "rwx:a+f a+b:IncorrectFileMode");
    EXPECT_EQ(summaryOf("rw"), "rw:rwf a+b:ConflictingExclusiveFileModes");
    EXPECT_EQ(summaryOf("aW"), "aW:wa a+b:ConflictingExclusiveFileModes");
    EXPECT_EQ(summary(FilePermission()), "r:rf rb");

    FilePermission permission("rw", false);
    permission = "w";
    EXPECT_EQ(summary(permission), "w:wf wb") << "the old error is forgotten";
    permission.valid = false;
    EXPECT_EQ(summary(permission), "w:wf wb:badpermission_vx");
}

}  // namespace
