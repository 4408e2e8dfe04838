#include "embedded/services/array.h"
#include "tests/support/printing.h"
#include "tests/support/test_files.h"

#include <gtest/gtest.h>

namespace Orvandeil::FileIO {
namespace {

using fileio_tests::toUtf8;
using support::FaultyFile;
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
        summary += toUtf8({static_cast<const char16_t*>(text.get()), units});
        summary += '(' + std::to_string(result) + (opened.stream.EndOfData() ? ")$" : ")");
    }
}

// The same of a text. At the maximum not even the second half of a pair is taken.
std::string modelOf(std::u16string_view text, long max) {
    std::string summary;
    while (!text.empty() && (max > 0 || max == -1)) {
        const auto limit = static_cast<std::size_t>(max);
        const std::size_t body = std::min({text.find_first_of(u"\r\n"), text.size(), limit});
        const bool isPair = body + 1 < limit && text.substr(body, 2) == u"\r\n";
        const std::size_t result = isPair ? 2 : body < std::min(limit, text.size()) ? 1 : 0;
        const std::size_t length = body + result;
        summary += toUtf8(text.substr(0, length)) + '(' + std::to_string(result) + ')';
        text.remove_prefix(length);
        if (text.empty()) summary += '$';
    }
    return summary;
}

// Every text of five characters, one of which takes several bytes.
TEST(GetLine, AgreesWithTheModel) {
    for (unsigned code = 0; code < 4 * 4 * 4 * 4 * 4; ++code) {
        std::u16string text;
        for (unsigned rest = code; text.size() < 5; rest /= 4)
            text += u"a\u3042\r\n"[rest % 4];
        const auto* const units = reinterpret_cast<const char*>(text.data());
        FaultyFile utf8{.bytes = toUtf8(text)};
        FaultyFile utf16{.bytes = std::string(units, 2 * text.size())};
        for (const long max : {-2, -1, 0, 1, 2, 3, 9}) {
            utf8.offset = utf16.offset = 0;
            OpenedFile narrow(utf8.open("r"), "r", "UTF-8");
            OpenedFile wide(utf16.open("r"), "r", "UTF-16LE");
            ASSERT_EQ(linesOf(narrow, max), modelOf(text, max)) << "at most " << max;
            ASSERT_EQ(linesOf(wide, max), modelOf(text, max)) << "at most " << max;
            ASSERT_EQ(narrow.stream.getErrorCode() + wide.stream.getErrorCode(), 0);
        }
    }
}

// Lines longer than the decoder's pieces, and the file's own buffer.
TEST(GetLine, LongLines) {
    std::string bytes;
    std::string expected;
    for (unsigned long length = 0; length < 9000; length = 3 * length + 1) {
        bytes += std::string(length, 'x') + "\r\n";
        expected += std::string(length, 'x') + "\r\n(2)";
    }
    const TempFile file(bytes);
    OpenedFile opened(file.path());
    EXPECT_EQ(linesOf(opened, -1), expected + '$');
}

}  // namespace
}  // namespace Orvandeil::FileIO
