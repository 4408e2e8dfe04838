#include "embedded/services/console.h"
#include "tests/support/printing.h"
#include "tests/support/recorded_console.h"
#include "tests/support/test_files.h"

#include <cstdlib>

#include <gtest/gtest.h>

namespace Orvandeil::FileIO {
namespace {

using namespace std::literals;
using support::OpenedFile;
using support::RecordedConsole;
using support::TempFile;

// Text that is told from Latin-1 and UTF-8 by its bytes alone.
const std::string byteOrderMark = "\xFE\xFF\0a\0b\0c"s;
const std::string frenchLatin1 = "Il a \351t\351 d\351cid\351 que la premi\350re le\347on";
const std::string frenchUtf8 = "Il a \303\251t\303\251 d\303\251cid\303\251 que la le\303\247on";

TEST(CharsetDetection, ExaminesTheRestOfTheFile) {
    const struct {
        int line;
        std::string bytes;
        unsigned long start;
        const char* charset;
    } rows[] = {
        {__LINE__, "", 0, "UTF-8"},
        {__LINE__, byteOrderMark, 0, "UTF-16BE"},
        {__LINE__, frenchLatin1, 0, "ISO-8859-1"},
        {__LINE__, frenchUtf8, 0, "UTF-8"},
        {__LINE__, byteOrderMark + frenchLatin1, byteOrderMark.size(), "ISO-8859-1"},
        {__LINE__, frenchLatin1, frenchLatin1.size(), "UTF-8"},
        {__LINE__, frenchLatin1, ~0UL, "UTF-8"},
    };
    for (const auto& row : rows) {
        const TempFile file(row.bytes);
        OpenedFile opened(file.path());
        opened.read(1);
        const long position = opened.position();
        EXPECT_EQ(opened.stream.DetectCharset(row.start), row.charset) << "line " << row.line;
        EXPECT_EQ(opened.position(), position) << "line " << row.line;
        EXPECT_EQ(opened.stream.getErrorCode(), 0) << "line " << row.line;
    }
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
    OpenedFile opened(file.path());
    RecordedConsole error(vxConsoleError());
    const auto detectAs = [&](const std::u16string& name) {
        return fileStream(opened.file, "", opened.permission, name).DetectCharset(0);
    };
    EXPECT_EQ(detectAs(u"/nowhere/at/all"), "UTF-8");
    EXPECT_EQ(detectAs(u"/tmp"), "UTF-8");
    EXPECT_EQ(detectAs(fileio_tests::toUtf16(file.path()) + u'\0'), "UTF-8");
    EXPECT_EQ(error.text.substr(0, error.text.rfind(start)),
              start + "fopen failed: error : No such file or directory for /nowhere/at/all\n" +
                  start + "fread failed: error : Is a directory for /tmp\n");
    // An empty file is not opened a second time.
    error.text.clear();
    const TempFile empty;
    OpenedFile nothing(empty.path());
    EXPECT_EQ(fileStream(nothing.file, "", nothing.permission, u"/nowhere").DetectCharset(0),
              "UTF-8");
    EXPECT_EQ(error.text, "");
}

// The limit is read once in a process, so that each value needs a process of its own.
TEST(CharsetDetectionDeathTest, Limit) {
    GTEST_FLAG_SET(death_test_style, "threadsafe");
    const struct {
        int line;
        const char* limit;
        unsigned long fileBytes;
        const char* charset;
    } rows[] = {
        {__LINE__, nullptr, 100, "UTF-16BE"}, {__LINE__, "-1", 100, "UTF-16BE"},
        {__LINE__, "100", 100, "UTF-8"},      {__LINE__, "100", 99, "UTF-16BE"},
        {__LINE__, "100abc", 99, "UTF-16BE"}, {__LINE__, "abc", 2, "UTF-8"},
        {__LINE__, "", 2, "UTF-8"},           {__LINE__, "0x40", 2, "UTF-8"},
        {__LINE__, "-2", 2, "UTF-8"},
    };
    for (const auto& row : rows) {
        const auto detect = [&row] {
            unsetenv("QZ_FOPEN_CHARSET_DETECT_LIMIT");
            if (row.limit) setenv("QZ_FOPEN_CHARSET_DETECT_LIMIT", row.limit, 1);
            std::string bytes = byteOrderMark;
            bytes.resize(row.fileBytes, ' ');
            std::string charset;
            {
                const TempFile file(bytes);
                OpenedFile opened(file.path());
                charset = opened.stream.DetectCharset(0);
                setenv("QZ_FOPEN_CHARSET_DETECT_LIMIT", "1", 1);
                if (opened.stream.DetectCharset(0) != charset) charset += ", changed";
            }
            std::fprintf(stderr, "answer <%s>\n", charset.c_str());
            std::exit(0);
        };
        EXPECT_EXIT(detect(), testing::ExitedWithCode(0),
                    std::string("answer <") + row.charset + ">")
            << "line " << row.line;
    }
}

}  // namespace
}  // namespace Orvandeil::FileIO
