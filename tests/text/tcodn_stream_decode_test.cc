#include "tests/support/raised.h"
#include "tests/text/memory_stream.h"

#include <gtest/gtest.h>

namespace Orvandeil::FileIO {
namespace {

using namespace std::literals;

std::u16string contents(OutputBuffer& buffer) {
    std::u16string units;
    buffer.ResetNext();
    while (const void* unit = buffer.GetNext())
        units += *static_cast<const char16_t*>(unit);
    return units;
}

TEST(Decoding, FillsBuffers) {
    std::string bytes;
    for (int i = 0; i < 300; ++i)
        bytes += "a\xC3\xA9\xE3\x81\x82 z";
    const std::u16string expected = decodedAtOnce("UTF-8", bytes);
    std::size_t consumed = 99;
    for (const unsigned long n : {0UL, 1UL, 70UL, 240UL, 1UL << 40}) {
        MemoryStream stream("UTF-8", bytes);
        OutputBuffer buffer(vxCHAR_CLASS, 4, 4, 16);
        EXPECT_EQ(stream.GetNCodePoints(buffer, n, &consumed), std::min(n, expected.size()));
        EXPECT_EQ(contents(buffer), expected.substr(0, n));
        EXPECT_EQ(consumed, stream.position());
    }
    MemoryStream stream("UTF-8", bytes);
    OutputBuffer buffer(vxCHAR_CLASS, 4, 4, 16);
    // Chunks of 8 and then 16 units; the last round is the short one.
    EXPECT_EQ(stream.GetNCodePoints(buffer, &consumed), (expected.size() - 8) % 16);
    EXPECT_EQ(consumed, bytes.size());
    EXPECT_EQ(contents(buffer), expected);
    EXPECT_EQ(stream.getUTF16Position(), expected.size());
}

TEST(Decoding, AsksForDetectionOnlyWhereAsciiEnds) {
    using Starts = std::vector<unsigned long>;
    const auto detections = [](std::string_view bytes, unsigned long step) {
        MemoryStream stream("", bytes);
        std::u16string all, part(step, u'x');
        for (; part.size() == step; all += part)
            stream.GetNCodePoints(part, step, nullptr);
        EXPECT_EQ(all, decodedAtOnce("UTF-8", bytes));
        return stream.detections;
    };
    EXPECT_EQ(detections("abc", 8), Starts());
    EXPECT_EQ(detections("ab\xC3\xA9", 4), Starts{2});
    EXPECT_EQ(detections("ab\xC3\xA9", 1), Starts{0});
    EXPECT_EQ(detections("ab\0"sv, 3), Starts()) << "a NUL that ends a read is no sign of anything";
    EXPECT_EQ(detections("a\0b\0"sv, 4), Starts{1});
    EXPECT_EQ(detections("a\0b\0"sv, 1), Starts());
}

TEST(TcodnStream, OpensTheDetectedEncoding) {
    const auto nameOf = [](const char* detected) {
        MemoryStream stream("");
        stream.detected = detected;
        return stream.GetEncodingName();
    };
    EXPECT_EQ(nameOf("latin1"), "ISO-8859-1");
    EXPECT_EQ(nameOf(""), "UTF-8");
    EXPECT_EQ(fileio_tests::raisedBy([&] { nameOf("elvish"); }),
              "KESTRA:iofun:InvalidEncoding elvish");
}

}  // namespace
}  // namespace Orvandeil::FileIO
