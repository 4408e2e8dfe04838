#include "fileio/streams/carry_byte.h"

#include "fileio/errors/code_list.h"
#include "fileio/host/data_sizes.h"
#include "tests/support/test_files.h"

#include <cerrno>
#include <random>

#include <gtest/gtest.h>

namespace Orvandeil::FileIO {
namespace {

using support::FaultyFile;
using support::OpenedFile;
using support::TempFile;

constexpr int littleEndian = 0;
constexpr int bigEndian = 1;

// A carry of `bits` bits, as a host's bit transfer leaves it.
void setCarry(CarryByte& carry, bool isRead, int format, int value, int bits) {
    carry.ResetCarryByte(isRead, format);
    carry.active = true;
    carry.carryValue = static_cast<unsigned char>(value);
    carry.pendingBits = bits;
}

TEST(CarryByte, MergesWithTheFile) {
    const struct {
        int line;
        const char* mode;
        const char* content;
        int format, value, bits;
        int result;
        const char* after;
        int code;
    } rows[] = {
        {__LINE__, "r+", "\xFF", bigEndian, 0xA0, 3, 0, "\xBF", 0},
        {__LINE__, "r+", "\xFF", littleEndian, 0x05, 3, 0, "\xFD", 0},
        {__LINE__, "r+", "\x55z", bigEndian, 0x80, 1, 0, "\xD5z", 0},
        {__LINE__, "r+", "\xD5z", littleEndian, 0x00, 7, 0, "\x80z", 0},
        {__LINE__, "r+", "\xFF", littleEndian, 0x41, 8, 0, "A", 0},
        {__LINE__, "r+", "", littleEndian, 0x41, 8, 0, "A", 0},
        {__LINE__, "r+", "", littleEndian, 0x01, 3, 1, "", code::ReadFailed},
        {__LINE__, "r+", "\xFF", littleEndian, 0x01, 0, 0, "\xFF", 0},
        {__LINE__, "w", "", bigEndian, 0xA0, 3, 0, "\xA0", 0},
        {__LINE__, "w+", "", littleEndian, 0x05, 3, 0, "\x05", 0},
        {__LINE__, "a", "x", littleEndian, 0x05, 3, 1, "x", code::IsOpenWrite},
        {__LINE__, "r", "\xFF", littleEndian, 0x05, 3, 1, "\xFF", code::IsOpenWrite},
    };
    for (const auto& row : rows) {
        const TempFile file(row.content);
        {
            OpenedFile opened(file.path(), row.mode);
            CarryByte& carry = opened.stream.getCarryByte();
            setCarry(carry, false, row.format, row.value, row.bits);
            EXPECT_EQ(carry.FlushAndResetCarryByte(), row.result) << "line " << row.line;
            EXPECT_EQ(carry.active, row.result == 1) << "line " << row.line;
            EXPECT_EQ(carry.pendingBits, row.bits) << "line " << row.line;
            EXPECT_EQ(opened.stream.getErrorCode(), row.code) << "line " << row.line;
        }
        EXPECT_EQ(file.content(), row.after) << "line " << row.line;
    }
}

// What a bit transfer leaves, for every state of the carry that it finds.
TEST(CarryByte, CheckBeforeABitTransfer) {
    for (int states = 0; states < 32; ++states) {
        const bool active = states & 1, wasRead = states & 2, isRead = states & 4;
        const int oldFormat = (states & 8) / 8, format = (states & 16) / 16;
        const TempFile file("\xFF\xFF");
        OpenedFile opened(file.path(), "r+");
        CarryByte& carry = opened.stream.getCarryByte();
        setCarry(carry, wasRead, oldFormat, 0, 4);
        carry.active = active;
        EXPECT_TRUE(carry.CheckCarryByte(1, format, isRead));
        const bool goesOn = active && wasRead == isRead && oldFormat == format;
        EXPECT_EQ(carry.pendingBits, goesOn ? 4 : 0) << states;
        EXPECT_EQ(carry.lastWasWrite, isRead ? 0 : 1) << states;
        EXPECT_EQ(carry.bitOrder, format) << states;
        EXPECT_EQ(carry.active, active) << states;
        EXPECT_EQ(opened.position(), active && !wasRead && !goesOn ? 1 : 0) << states;
    }
}

TEST(CarryByte, BitsThatCannotBeSettledStay) {
    const TempFile file("\xFF\xFF");
    OpenedFile opened(file.path());
    CarryByte& carry = opened.stream.getCarryByte();
    EXPECT_TRUE(carry.CheckCarryByte(0, littleEndian, true));
    setCarry(carry, false, littleEndian, 0, 4);
    EXPECT_FALSE(carry.CheckCarryByte(0, littleEndian, true));
    EXPECT_FALSE(carry.CheckCarryByte(1, littleEndian, true));
    EXPECT_EQ(carry.FseekHandleCarryByte(), 1);
    EXPECT_TRUE(carry.active);
    // The direction is forced: bits that were read are written as well.
    setCarry(carry, true, littleEndian, 0, 4);
    EXPECT_EQ(carry.WriteCarryByte(), 0);
    EXPECT_EQ(carry.fiPkWriteCarryByte(), 1);
}

TEST(CarryByte, SeeksStartAtThePartlyUsedByte) {
    const TempFile file("\xFF\xFF\xFF");
    OpenedFile opened(file.path(), "r+");
    CarryByte& carry = opened.stream.getCarryByte();
    opened.stream.setPosition(1);
    setCarry(carry, false, bigEndian, 0, 4);
    EXPECT_EQ(carry.FseekHandleCarryByte(), 0);
    EXPECT_EQ(opened.read(2), "\x0F\xFF");
    setCarry(carry, true, bigEndian, 0, 4);
    EXPECT_EQ(carry.FseekHandleCarryByte(), 0);
    EXPECT_EQ(opened.position(), 3);

    FaultyFile pipe{.bytes = "", .failingSeek = 1, .error = ESPIPE};
    OpenedFile unseekable(pipe.open("w"), "w");
    setCarry(unseekable.stream.getCarryByte(), false, bigEndian, 0x80, 4);
    EXPECT_NE(unseekable.stream.getCarryByte().FseekHandleCarryByte(), 0);
    EXPECT_EQ(unseekable.stream.getErrorCode(), ESPIPE);
    EXPECT_EQ(pipe.bytes, "\x80");
}

TEST(CarryByte, EndOfFileQueryForgetsErrors) {
    const TempFile file("ab");
    OpenedFile opened(file.path());
    CarryByte& carry = opened.stream.getCarryByte();
    opened.stream.setPosition(-1);
    carry.CheckFeofCarryByte();
    EXPECT_EQ(opened.stream.getErrorCode(), EINVAL);
    setCarry(carry, true, bigEndian, 0, 4);
    carry.CheckFeofCarryByte();
    EXPECT_EQ(opened.stream.getErrorCode(), 0);
    opened.read(9);
    carry.CheckFeofCarryByte();
    EXPECT_TRUE(opened.stream.EndOfData());
}

// Writes bits one by one behind the carry, as a host's bit transfer does.
void writeBits(OpenedFile& opened, int format, const std::vector<bool>& bits) {
    CarryByte& carry = opened.stream.getCarryByte();
    ASSERT_TRUE(carry.CheckCarryByte(1, format, false));
    carry.active = true;
    for (const bool bit : bits) {
        const int place = carry.bitOrder == bigEndian ? 7 - carry.pendingBits : carry.pendingBits;
        carry.carryValue = static_cast<unsigned char>(carry.carryValue | (bit ? 1 << place : 0));
        if (++carry.pendingBits < 8) continue;
        ASSERT_EQ(opened.stream.PutNElements(1, &carry.carryValue, 1), 1u);
        carry.pendingBits = 0;
        carry.carryValue = 0;
    }
}

// The same on a string of bytes: the model.
struct BitModel {
    std::string bytes;
    std::size_t bit = 0;

    void write(int format, const std::vector<bool>& bits) {
        for (const bool value : bits) {
            const std::size_t place = format == bigEndian ? 7 - bit % 8 : bit % 8;
            const int mask = 1 << place;
            const int old = bytes[bit / 8];
            bytes[bit / 8] = static_cast<char>(value ? old | mask : old & ~mask);
            ++bit;
        }
    }
    void alignUp() { bit = (bit + 7) / 8 * 8; }
};

TEST(CarryByte, RandomTransfersAgainstAModel) {
    constexpr std::size_t fileBytes = 64;
    for (unsigned seed = 0; seed < 100; ++seed) {
        std::mt19937 random(seed);
        const auto below = [&random](unsigned long limit) { return random() % limit; };
        BitModel model;
        for (std::size_t i = 0; i < fileBytes; ++i)
            model.bytes += static_cast<char>(below(256));
        const TempFile file(model.bytes);
        {
            OpenedFile opened(file.path(), "r+");
            CarryByte& carry = opened.stream.getCarryByte();
            int format = littleEndian;
            for (int step = 0; step < 12; ++step) {
                const unsigned long action = below(4);
                if (action == 0) {
                    ASSERT_EQ(carry.FseekHandleCarryByte(), 0);
                    const unsigned long byte = below(fileBytes / 2);
                    opened.stream.setPosition(static_cast<long>(byte));
                    model.bit = 8 * byte;
                } else if (action == 1) {
                    ASSERT_TRUE(carry.CheckCarryByte(0, format, false));
                    opened.stream.PutNElements(1, "#", 1);
                    model.alignUp();
                    model.bytes[model.bit / 8] = '#';
                    model.bit += 8;
                } else {
                    const int newFormat = static_cast<int>(below(2));
                    if (newFormat != format) model.alignUp();
                    format = newFormat;
                    std::vector<bool> bits;
                    for (unsigned long left = below(20); left > 0; --left)
                        bits.push_back(below(2) == 1);
                    writeBits(opened, format, bits);
                    model.write(format, bits);
                }
            }
            ASSERT_EQ(carry.FlushAndResetCarryByte(), 0);
        }
        ASSERT_EQ(file.content(), model.bytes) << "seed " << seed;
    }
}

}  // namespace
}  // namespace Orvandeil::FileIO
