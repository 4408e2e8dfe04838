#include "fileio/attributes/file_permission.h"

#include "fileio/host/exception.h"

#include <string>

#include <gtest/gtest.h>

namespace {

using Orvandeil::FileIO::FilePermission;

std::string validationError(const FilePermission& permission) {
    try {
        permission.Validate();
    } catch (const foundation::core::except::IMsgIDException& error) {
        return error.GetID();
    }
    return "";
}

// The flags as the letters that set them, in field order: "rwa+bt", 'f' for automatic flushing.
std::string flags(const FilePermission& p) {
    std::string letters;
    if (p.read) letters += 'r';
    if (p.write) letters += 'w';
    if (p.append) letters += 'a';
    if (p.update) letters += '+';
    if (p.binary) letters += 'b';
    if (p.textMode) letters += 't';
    if (p.autoFlush) letters += 'f';
    return letters;
}

constexpr char badPermission[] = "KESTRA:legacy_two_part:badpermission_vx";
constexpr char incorrect[] = "KESTRA:fopen:IncorrectFileMode";
constexpr char conflicting[] = "KESTRA:fopen:ConflictingExclusiveFileModes";

TEST(FilePermission, AcceptsModes) {
    const struct {
        int line;
        const char* mode;
        const char* kept;
        const char* fopenMode;
        const char* flags;
    } rows[] = {
        {__LINE__, "r", "r", "rb", "rf"},        {__LINE__, "rb", "rb", "rb", "rbf"},
        {__LINE__, "rt", "r", "rb", "rtf"},      {__LINE__, "rbt", "rb", "rb", "rbtf"},
        {__LINE__, "rtt", "rt", "rb", "rtf"},  // one 't' is dropped, not all
        {__LINE__, "w", "w", "wb", "wf"},        {__LINE__, "A", "A", "ab", "a"},
        {__LINE__, "r+b", "r+b", "r+b", "r+bf"}, {__LINE__, "W", "W", "wb", "w"},
        {__LINE__, "w+t", "w+", "w+b", "w+tf"},  {__LINE__, "a+", "a+", "a+b", "a+f"},
        {__LINE__, "W+", "W+", "w+b", "w+"},     {__LINE__, "rr", "rr", "rb", "rf"},
        {__LINE__, "aA", "aA", "ab", "a"},  // the large letter decides, wherever it stands
    };
    for (const auto& row : rows) {
        const FilePermission permission(row.mode, true);
        EXPECT_TRUE(permission.valid) << row.line;
        EXPECT_EQ(permission.text, row.kept) << row.line;
        EXPECT_STREQ(permission.fileSystemFormat, row.fopenMode) << row.line;
        EXPECT_EQ(flags(permission), row.flags) << row.line;
        EXPECT_TRUE(permission.constructionFlag) << row.line;
        EXPECT_EQ(validationError(permission), "") << row.line;
    }
}

TEST(FilePermission, KeepsErrorsUntilValidated) {
    const struct {
        int line;
        const char* mode;
        const char* identifier;
        const char* flags;  // before: "a+"
    } rows[] = {
        {__LINE__, "", badPermission, "a+f"},
        {__LINE__, "+r", badPermission, "a+f"},
        {__LINE__, "t", badPermission, "a+f"},
        {__LINE__, "xr", badPermission, "a+f"},
        {__LINE__, "rx", incorrect, "a+f"},
        {__LINE__, "rwx", incorrect, "a+f"},  // foreign letters before conflicts
        {__LINE__, "r ", incorrect, "a+f"},
        {__LINE__, "rt,ccs=UTF-8", incorrect, "a+f"},
        {__LINE__, "rw", conflicting, "rwf"},
        {__LINE__, "aW", conflicting, "wa"},
    };
    for (const auto& row : rows) {
        FilePermission permission("a+", false);
        permission = row.mode;
        EXPECT_FALSE(permission.valid) << row.line;
        EXPECT_EQ(permission.text, row.mode) << row.line;
        EXPECT_EQ(flags(permission), row.flags) << row.line;
        EXPECT_STREQ(permission.fileSystemFormat, "a+b") << row.line;
        const FilePermission copy = permission;
        EXPECT_EQ(validationError(permission), row.identifier) << row.line;
        EXPECT_EQ(validationError(permission), row.identifier) << row.line << ": second time";
        EXPECT_EQ(validationError(copy), row.identifier) << row.line << ": copy";
    }
}

TEST(FilePermission, StartsForReadingAndForgetsOldErrors) {
    FilePermission permission;
    EXPECT_EQ(flags(permission) + permission.text + permission.fileSystemFormat, "rfrrb");
    EXPECT_FALSE(permission.constructionFlag);

    permission = "rw";
    permission = "w";
    EXPECT_EQ(validationError(permission), "");

    permission.valid = false;  // invalid without a stored error: the general one
    EXPECT_EQ(validationError(permission), badPermission);
}

}  // namespace
