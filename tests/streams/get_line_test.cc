#include "embedded/services/array.h"
#include "fileio/constants.h"
#include "tests/support/printing.h"
#include "tests/support/test_files.h"

#include <gtest/gtest.h>

namespace Orvandeil::FileIO {
namespace {

using namespace std::literals;
using support::OpenedFile;
using support::TempFile;

// Every line as "text(result)", then "$" as soon as the end-of-file indicator is set.
std::string linesOf(OpenedFile& opened, long max) {
    std::string summary;
    while (true) {
        OutputBuffer line(vxCHAR_CLASS, 16, 4, 64);
        const int result = opened.stream.GetLine(max, line);
        const std::size_t units = line.GetSize();
        if (units == 0) return summary;
        const auto text = line.Transfer();
        const std::u16string_view view(static_cast<const char16_t*>(text.get()), units);
        summary += fileio_tests::toUtf8(view) + '(' + std::to_string(result) + ')';
        if (opened.stream.EndOfData()) summary += '$';
    }
}

TEST(GetLine, EndsOfLines) {
    const struct {
        int line;
        std::string_view bytes;
        const char* encoding;
        long max;
        std::string_view lines;
    } rows[] = {
        {__LINE__, "", "", -1, ""},
        {__LINE__, "a", "", -1, "a(0)$"},
        {__LINE__, "a\nb", "", -1, "a\n(1)b(0)$"},
        {__LINE__, "a\n", "", -1, "a\n(1)$"},
        {__LINE__, "\n\n", "", -1, "\n(1)\n(1)$"},
        {__LINE__, "a\rx\r", "", -1, "a\r(1)x\r(1)$"},
        {__LINE__, "a\r\nb\r\n", "", -1, "a\r\n(2)b\r\n(2)$"},
        {__LINE__, "\n\r\r\n", "", -1, "\n(1)\r(1)\r\n(2)$"},
        // At the maximum nothing is looked at any more, not even the second half of a pair.
        {__LINE__, "abcd\n", "", 2, "ab(0)cd(0)\n(1)$"},
        {__LINE__, "ab\r\ncd", "", 3, "ab\r(1)\n(1)cd(0)$"},
        {__LINE__, "ab\r\ncd", "", 4, "ab\r\n(2)cd(0)$"},
        {__LINE__, "ab\nc", "", 3, "ab\n(1)c(0)$"},
        {__LINE__, "ab", "", 0, ""},
        {__LINE__, "ab", "", -2, ""},
        // What is looked at and put back takes more than one byte.
        {__LINE__, "a\n\xC3\xA9\n\xE3\x81\x82", "UTF-8", -1, "a\n(1)\xC3\xA9\n(1)\xE3\x81\x82(0)$"},
        {__LINE__, "a\r\xF0\x9F\x98\x80z", "UTF-8", -1, "a\r(1)\x1Az(0)$"},
        {__LINE__, "a\0\n\0b\0\r\0\n\0"sv, "UTF-16LE", -1, "a\n(1)b\r\n(2)$"},
        {__LINE__, "\0\n\0b"sv, "UTF-16BE", -1, "\n(1)b(0)$"},
        {__LINE__, "\xE9\n\xFF", "ISO-8859-1", -1, "\xC3\xA9\n(1)\xC3\xBF(0)$"},
        {__LINE__, "\x82\xA0\n\x82\xA2", "Shift_JIS", 2, "\xE3\x81\x82\n(1)\xE3\x81\x84(0)$"},
        {__LINE__, "a\nb\xC3\xA9\n", "", -1, "a\n(1)b\xC3\xA9\n(1)$"},
    };
    for (const auto& row : rows) {
        const TempFile file(row.bytes);
        OpenedFile opened(file.path(), "r", row.encoding);
        EXPECT_EQ(linesOf(opened, row.max), row.lines) << "line " << row.line;
        EXPECT_EQ(opened.stream.getErrorCode(), 0) << "line " << row.line;
    }
}

// Lines longer than the decoder's pieces, and the file's own buffer.
TEST(GetLine, LongLines) {
    std::string bytes;
    std::string expected;
    for (unsigned long length = 0; length < 9000; length = 3 * length + 1) {
        const std::string text(length, 'x');
        bytes += text + "\r\n";
        expected += text + "\r\n(2)";
    }
    const TempFile file(bytes);
    OpenedFile opened(file.path());
    EXPECT_EQ(linesOf(opened, -1), expected + '$');
}

}  // namespace
}  // namespace Orvandeil::FileIO
