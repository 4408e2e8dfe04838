#include "embedded/services/console.h"
#include "tests/support/printing.h"
#include "tests/support/recorded_console.h"
#include "tests/support/test_files.h"

#include <cstdlib>

#include <gtest/gtest.h>

namespace Orvandeil::FileIO {
namespace {

using support::OpenedFile;
using support::TempFile;

const std::string frenchLatin1 = "Il a \351t\351 d\351cid\351 que la premi\350re le\347on";

TEST(CharsetDetection, ExaminesTheRestOfTheFileAndStaysWhereItIs) {
    const TempFile file("\xFE\xFF" + frenchLatin1);
    OpenedFile opened(file.path());
    opened.read(1);
    EXPECT_EQ(opened.stream.DetectCharset(0), "UTF-16BE");
    EXPECT_EQ(opened.stream.DetectCharset(2), "ISO-8859-1");
    for (const unsigned long nothing : {file.content().size(), ~0UL})
        EXPECT_EQ(opened.stream.DetectCharset(nothing), "UTF-8");
    // The limit has been read, once in a process.
    setenv("QZ_FOPEN_CHARSET_DETECT_LIMIT", "1", 1);
    EXPECT_EQ(opened.stream.DetectCharset(2), "ISO-8859-1");
    unsetenv("QZ_FOPEN_CHARSET_DETECT_LIMIT");
    EXPECT_EQ(opened.position(), 1);
    EXPECT_EQ(opened.stream.getErrorCode(), 0);
}

TEST(CharsetDetection, DecidesTheEncodingAtTheFirstForeignByte) {
    const TempFile file(frenchLatin1);
    OpenedFile opened(file.path());
    std::u16string text;
    opened.stream.GetNCodePoints(text, 6, nullptr);
    EXPECT_EQ(text, u"Il a \u00E9");
    EXPECT_EQ(opened.stream.GetEncodingName(), "ISO-8859-1");
}

TEST(CharsetDetection, SaysWhyItFailed) {
    const std::string start = "fileStream::DetectCharset():";
    const TempFile file(frenchLatin1);
    const TempFile empty;
    const support::RecordedConsole error(vxConsoleError());
    const auto detect = [](const TempFile& content, const std::u16string& name) {
        OpenedFile opened(content.path());
        return fileStream(opened.file, "", opened.permission, name).DetectCharset(0);
    };
    EXPECT_EQ(detect(file, u"/nowhere/at/all"), "UTF-8");
    EXPECT_EQ(detect(file, u"/tmp"), "UTF-8");
    EXPECT_EQ(detect(empty, u"/nowhere"), "UTF-8");  // is not opened a second time
    EXPECT_EQ(error.text,
              start + "fopen failed: error : No such file or directory for /nowhere/at/all\n" +
                  start + "fread failed: error : Is a directory for /tmp\n");
    EXPECT_EQ(detect(file, fileio_tests::toUtf16(file.path()) + u'\0'), "UTF-8");
}

}  // namespace
}  // namespace Orvandeil::FileIO
