#include "fileio/streams/carry_byte.h"

#include "fileio/errors/code_list.h"
#include "tests/support/test_files.h"

#include <cerrno>

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
        int format, value, bits, code;
        const char* after;
    } rows[] = {{__LINE__, "r+", "\x55z", bigEndian, 0x80, 1, 0, "\xD5z"},
                {__LINE__, "r+", "", littleEndian, 0x41, 8, 0, "A"},
                {__LINE__, "r+", "", littleEndian, 0x01, 3, code::ReadFailed, ""},
                {__LINE__, "r+", "\xFF", littleEndian, 0x01, 0, 0, "\xFF"},
                {__LINE__, "w", "", bigEndian, 0xA0, 3, 0, "\xA0"},
                {__LINE__, "w+", "", littleEndian, 0x05, 3, 0, "\x05"},
                {__LINE__, "a", "x", littleEndian, 0x05, 3, code::IsOpenWrite, "x"},
                {__LINE__, "r", "x", littleEndian, 0x05, 3, code::IsOpenWrite, "x"}};
    for (const auto& row : rows) {
        SCOPED_TRACE(row.line);
        const TempFile file(row.content);
        {
            OpenedFile opened(file.path(), row.mode);
            CarryByte& carry = opened.stream.getCarryByte();
            setCarry(carry, false, row.format, row.value, row.bits);
            EXPECT_EQ(carry.FlushAndResetCarryByte(), row.code != 0);
            EXPECT_EQ(carry.active, row.code != 0);
            EXPECT_EQ(carry.pendingBits, row.bits);
            EXPECT_EQ(opened.stream.getErrorCode(), row.code);
        }
        EXPECT_EQ(file.content(), row.after);
    }
}

// What a bit transfer leaves, for every state of the carry that it finds.
TEST(CarryByte, CheckBeforeABitTransfer) {
    for (int states = 0; states < 32; ++states) {
        SCOPED_TRACE(states);
        const bool active = states & 1, wasRead = states & 2, isRead = states & 4;
        const int oldFormat = states >> 3 & 1, format = states >> 4;
        const TempFile file("\xFF\xFF");
        OpenedFile opened(file.path(), "r+");
        CarryByte& carry = opened.stream.getCarryByte();
        setCarry(carry, wasRead, oldFormat, 0, 4);
        carry.active = active;
        EXPECT_TRUE(carry.CheckCarryByte(1, format, isRead));
        const bool goesOn = active && wasRead == isRead && oldFormat == format;
        EXPECT_EQ(carry.pendingBits, goesOn ? 4 : 0);
        EXPECT_EQ(carry.lastWasWrite, !isRead);
        EXPECT_EQ(carry.bitOrder, format);
        EXPECT_EQ(carry.active, active);
        EXPECT_EQ(opened.position(), active && !wasRead && !goesOn);
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

}  // namespace
}  // namespace Orvandeil::FileIO
