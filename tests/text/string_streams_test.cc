#include "embedded/services/memory.h"
#include "fileio/text/input_string_stream.h"
#include "fileio/text/output_string_stream.h"
#include "tests/support/printing.h"

#include <cstdint>

#include <gtest/gtest.h>

namespace Orvandeil::FileIO {
namespace {

using fileio_tests::taken;

long positionOf(stream& any) {
    long position = -1;
    EXPECT_EQ(any.getPosition(position), 0);
    return position;
}

// Fills the present block to its end, and returns its size.
long fill(outputStringStream& stream) {
    const embedded::FailingAllocation none(1);
    EXPECT_ANY_THROW(while (stream.PutNElements(1, "x", 1) == 1));
    return positionOf(stream);
}

TEST(OutputStringStream, GrowsByItsCapacityAndTheNeed) {
    const auto capacityAfter = [](std::initializer_list<unsigned long> writes) {
        outputStringStream stream("UTF-8");
        for (const unsigned long count : writes)
            EXPECT_EQ(stream.PutNElements(count, std::string(count, 'a').data(), 1), count);
        const long capacity = fill(stream);
        EXPECT_EQ(stream.PutNElements(1, "z", 1), 1U) << "the block outlives the failure";
        EXPECT_EQ(taken(stream).back(), 'z');
        return capacity;
    };
    EXPECT_EQ(capacityAfter({1024}), 1024);
    EXPECT_EQ(capacityAfter({1025}), 2048);
    EXPECT_EQ(capacityAfter({100, 1000}), 2048);
    EXPECT_EQ(capacityAfter({1024, 1}), 2048);
    EXPECT_EQ(capacityAfter({100, 1025}), 4096);
}

TEST(OutputStringStream, HandsItsBlockOver) {
    const std::size_t blocks = embedded::liveBlockCount();
    {
        outputStringStream stream("ISO-8859-1");
        EXPECT_EQ(stream.transferBuffer(), nullptr);
        stream.PutString(u"h\u00E9llo");
        EXPECT_EQ(taken(stream), "h\xE9llo");
        stream.PutString(u"again");
        EXPECT_EQ(fill(stream), 1024);
        stream.Rewind(1019);
        EXPECT_EQ(taken(stream), "again");
        stream.PutString(u"gone");
        stream.Rewind(4);
        EXPECT_EQ(stream.transferBuffer(), nullptr);
        stream.PutString(u"left to the destructor");
    }
    EXPECT_EQ(embedded::liveBlockCount(), blocks);
}

TEST(OutputStringStream, PrintsInItsEncoding) {
    outputStringStream string("");
    EXPECT_EQ(string.printf("%.1f", 0.5), 3);
    EXPECT_EQ(string.printf("%s", "caf\xE9"), 0);
    EXPECT_EQ(taken(string), std::string("0\0.\0005\0", 6));
}

TEST(InputStringStream, GivesBytesAndTakesNone) {
    inputStringStream input("abcdef", 6, "");
    char bytes[8] = {};
    EXPECT_EQ(input.GetNElements(2, bytes, 2), 4U) << "bytes, not elements";
    EXPECT_EQ(input.GetNElements(SIZE_MAX, bytes, 2), 2U);
    EXPECT_STREQ(bytes, "efcd");
    EXPECT_TRUE(input.Rewind(99));
    EXPECT_EQ(positionOf(input), 0);
    EXPECT_EQ(input.PutNElements(1, "x", 1), 0U);
    EXPECT_EQ(input.printf("x"), -1);
}

}  // namespace
}  // namespace Orvandeil::FileIO
