#include "embedded/services/memory.h"
#include "fileio/text/input_string_stream.h"
#include "fileio/text/output_string_stream.h"

#include <cstdint>
#include <cstring>

#include <gtest/gtest.h>

namespace Orvandeil::FileIO {
namespace {

long positionOf(stream& any) {
    long position = -1;
    EXPECT_EQ(any.getPosition(position), 0);
    return position;
}

std::string take(outputStringStream& stream) {
    std::string bytes(static_cast<std::size_t>(positionOf(stream)), '\0');
    void* block = stream.transferBuffer();
    if (block) std::memcpy(bytes.data(), block, bytes.size());
    vxMemoryFree(block);
    return bytes;
}

// Fills the present block to its end, and returns its size.
long fill(outputStringStream& stream) {
    const embedded::FailingAllocation none(1);
    try {
        while (stream.PutNElements(1, "x", 1) == 1)
            continue;
    } catch (const embedded::OutOfMemoryError&) {
    }
    return positionOf(stream);
}

TEST(OutputStringStream, GrowsByItsCapacityAndTheNeed) {
    const struct {
        int line;
        std::vector<unsigned long> writes;
        int capacity;
    } cases[] = {
        {__LINE__, {10}, 1024},        {__LINE__, {1024}, 1024},    {__LINE__, {1025}, 2048},
        {__LINE__, {100, 1000}, 2048}, {__LINE__, {1024, 1}, 2048}, {__LINE__, {100, 1025}, 4096},
    };
    for (const auto& row : cases) {
        outputStringStream stream("UTF-8");
        for (const unsigned long count : row.writes) {
            EXPECT_EQ(stream.PutNElements(count, std::string(count, 'a').data(), 1), count);
        }
        EXPECT_EQ(fill(stream), row.capacity) << "line " << row.line;
        EXPECT_EQ(stream.PutNElements(1, "z", 1), 1U) << "the block outlives the failure";
        EXPECT_EQ(take(stream).back(), 'z');
    }
    outputStringStream stream("");
    EXPECT_THROW(stream.PutNElements(SIZE_MAX / 2 + 1, "", 2), embedded::OutOfMemoryError);
    EXPECT_THROW(stream.EnsureSpace(SIZE_MAX), embedded::OutOfMemoryError);
}

TEST(OutputStringStream, HandsItsBlockOver) {
    const std::size_t blocks = embedded::liveBlockCount();
    {
        struct Counted : outputStringStream {
            using outputStringStream::outputStringStream;
            void Reset() override {
                ++resets;
                outputStringStream::Reset();
            }
            int resets = 0;
        } stream("ISO-8859-1");
        EXPECT_EQ(stream.transferBuffer(), nullptr);
        stream.PutString(u"h\u00E9llo");
        EXPECT_EQ(take(stream), "h\xE9llo");
        EXPECT_EQ(stream.resets, 2);
        stream.PutString(u"again");
        EXPECT_EQ(fill(stream), 1024);
        stream.Rewind(1019);
        EXPECT_EQ(take(stream), "again");
        stream.PutString(u"gone");
        stream.Rewind(4);
        EXPECT_EQ(stream.transferBuffer(), nullptr);
        stream.PutString(u"left to the destructor");
    }
    EXPECT_EQ(embedded::liveBlockCount(), blocks);
}

TEST(OutputStringStream, PrintsWhateverItsSizeWasSaidToBe) {
    for (const int width : {1, 7, 8, 9, 511, 512, 513, 70000}) {
        for (const unsigned long promised : {0UL, ~0UL}) {
            outputStringStream stream("UTF-8");
            stream.setBufferSize(promised);
            EXPECT_EQ(stream.printf("%*d%s", width - 1, 7, "."), std::max(width, 2));
            EXPECT_EQ(stream.printf("%d", 12), 2);
            const int blanks = std::max(width - 2, 0);
            EXPECT_EQ(take(stream), std::string(static_cast<std::size_t>(blanks), ' ') + "7.12");
        }
    }
    outputStringStream stream("");
    EXPECT_EQ(stream.printf("%.1f", 0.5), 3);
    EXPECT_EQ(stream.printf("%s", "caf\xE9"), 0);
    EXPECT_LT(stream.printf("%lc", static_cast<wint_t>(0x3042)), 0);
    EXPECT_EQ(take(stream), std::string("0\0.\0005\0", 6));
}

TEST(InputStringStream, CountsBytesAndUnits) {
    const struct {
        int line;
        const char* encoding;
        std::string text;
        unsigned long reads;  // units
        long bytes;
        unsigned long units;
    } cases[] = {
        {__LINE__, "", "a\xC3\xA9\xF0\x9F\x98\x80z", 0, 0, 0},
        {__LINE__, "", "a\xC3\xA9\xF0\x9F\x98\x80z", 3, 7, 4},
        {__LINE__, "", "a\xE3\x81z", 2, 3, 2},
        {__LINE__, "UTF-16", std::string("\xFF\xFE\x61\0b\0c\0", 8), 2, 6, 2},
        {__LINE__, "", std::string(3000, 'x'), 2500, 2500, 2500},
    };
    for (const auto& row : cases) {
        const long size = static_cast<long>(row.text.size());
        inputStringStream stream(row.text.c_str(), size, row.encoding);
        std::u16string text;
        stream.GetNCodePoints(text, row.reads, nullptr);
        EXPECT_EQ(positionOf(stream), row.bytes) << "line " << row.line;
        EXPECT_EQ(stream.getUTF16Position(), row.units) << "line " << row.line;
        EXPECT_FALSE(stream.EndOfData()) << "line " << row.line;
        // The question leaves the reading converter as it was.
        inputStringStream whole(row.text.c_str(), size, row.encoding);
        std::u16string expected;
        std::u16string rest;
        whole.GetNCodePoints(expected, row.text.size(), nullptr);
        stream.GetNCodePoints(rest, row.text.size(), nullptr);
        EXPECT_EQ(text + rest, expected) << "line " << row.line;
        EXPECT_TRUE(stream.EndOfData()) << "line " << row.line;
    }
}

TEST(StringStreams, AnswerForWhatTheyCannotDo) {
    inputStringStream input("abcdef", 6, "");
    char bytes[8] = {};
    EXPECT_EQ(input.GetNElements(2, bytes, 2), 4U) << "bytes, not elements";
    EXPECT_EQ(input.GetNElements(SIZE_MAX, bytes, 2), 2U);
    EXPECT_STREQ(bytes, "efcd");
    EXPECT_TRUE(input.Rewind(99));
    EXPECT_EQ(positionOf(input), 0);
    EXPECT_EQ(input.PutNElements(1, "x", 1), 0U);
    EXPECT_EQ(input.printf("x"), -1);

    outputStringStream output("");
    int status = 77;
    bool flag = true;
    EXPECT_EQ(output.scanOctal(-1, status, flag) + output.scanHex(-1, status, flag), 0U);
    EXPECT_EQ(output.scanUnsignedInteger(-1, status, flag), 0U);
    EXPECT_EQ(output.scanInteger(-1, status) + output.scanIntegerCouldBeHex(-1, status), 0);
    EXPECT_EQ(output.scanFloat(-1, status), 0.0);
    EXPECT_EQ(output.GetNElements(1, bytes, 1), 0U);
    EXPECT_FALSE(output.EndOfData());
    EXPECT_TRUE(status == 77 && flag && output.getErrorCode() == 0);
}

}  // namespace
}  // namespace Orvandeil::FileIO
