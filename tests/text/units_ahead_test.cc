#include "tests/support/printing.h"
#include "tests/support/scanning.h"
#include "tests/text/memory_stream.h"

#include <random>

#include <gtest/gtest.h>
#include <unicode/unistr.h>

namespace Orvandeil::FileIO {
namespace {

using support::FaultyFile;

// A class of its own is read unit by unit: what its bytes lie in is not looked at.
struct WatchingFile : fileStream {
    using fileStream::fileStream;
};

// Words, sets, characters, literals and lines in turn; everything that a reader can notice.
std::string readBy(fileStream& stream, std::FILE* file, unsigned choice) {
    std::string noticed;
    for (bool isMore = true; isMore; ++choice) {
        const char* const formats[] = {"%s",    "%3s", "%[^,\n]", "%5[a-f\xC3\xA9 ]", "%*[^,]",
                                       "%c%*c", ", ",  "%d",      "\xE3\x81\x82%s"};
        OutputBuffer line(vxCHAR_CLASS, 16, 16, 64);
        if (choice % 4 == 0) {
            const int ending = stream.GetLine(choice % 8 == 0 ? -1 : 7, line);
            noticed += std::to_string(ending) + ':';
            line.ResetNext();
            while (const void* unit = line.GetNext())
                noticed += std::to_string(*static_cast<const char16_t*>(unit)) + ' ';
        } else {
            const support::Scanned scanned =
                support::scan(stream, formats[choice * 7 % std::size(formats)], 2);
            noticed += scanned.summary() + ' ';
        }
        noticed += std::to_string(ftell(file)) + (std::feof(file) ? "$ " : " ") +
                   std::to_string(stream.getErrorCode()) + '\n';
        isMore = !std::feof(file) && choice < 400;
    }
    return noticed;
}

// Texts of every form, well-formed or not, through buffers of a few bytes, with and without seeks.
TEST(UnitsAhead, AreNoticedByNobody) {
    std::mt19937 random(1);
    const char16_t* const parts[] = {u"a",  u"bc",     u"def,",   u" ",  u"\n",         u"\r\n",
                                     u"\r", u"\u00E9", u"\u3042", u"12", u"\U0001F600", u"\u3000"};
    for (unsigned round = 0; round < 3000; ++round) {
        icu::UnicodeString text;
        for (auto count = random() % 60; count > 0; --count)
            text += parts[random() % std::size(parts)];
        const char* const encoding = round % 5 == 0 ? "" : statelessEncodings[random() % 10];
        std::string bytes(1000, '\0');
        bytes.resize(static_cast<std::size_t>(
            text.extract(0, text.length(), bytes.data(), 1000, *encoding ? encoding : "UTF-8")));
        for (auto faults = round % 3; faults > 0 && !bytes.empty(); --faults)
            bytes[random() % bytes.size()] = "\xC3\xFF\x81\0,"[random() % 5];
        FaultyFile first{.bytes = bytes, .failingSeek = round % 4 == 0, .error = ESPIPE};
        FaultyFile second = first;
        const std::size_t bufferSize = 1 + random() % 100;
        const unsigned choice = static_cast<unsigned>(random() % 100);
        FilePermission permission("r", false);
        permission.Validate();
        const auto noticed = [&]<class Stream>(FaultyFile& faulty, Stream*) {
            std::FILE* const file = faulty.open("r", bufferSize);
            Stream stream(file, encoding, permission, u"none");
            const std::string all = readBy(stream, file, choice);
            std::fclose(file);
            return all;
        };
        ASSERT_EQ(noticed(first, static_cast<fileStream*>(nullptr)),
                  noticed(second, static_cast<WatchingFile*>(nullptr)))
            << round << ' ' << encoding << ' ' << testing::PrintToString(bytes);
    }
}

}  // namespace
}  // namespace Orvandeil::FileIO
