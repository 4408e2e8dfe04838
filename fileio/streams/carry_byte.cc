#include "fileio/streams/carry_byte.h"

#include "fileio/host/data_sizes.h"
#include "fileio/streams/file_stream.h"

#include <cerrno>

namespace Orvandeil::FileIO {
namespace {

constexpr int bigEndian = 1;

// The bits of a file's byte that a carry of `count` bits leaves alone.
int bitsLeftAlone(int count, int bitOrder) {
    constexpr int allBits = 0xFF;
    return bitOrder == bigEndian ? allBits >> count : (allBits << count) & allBits;
}

}  // namespace

CarryByte::CarryByte(fileStream* owner) : stream(owner) {}

CarryByte::~CarryByte() = default;

int CarryByte::WriteCarryByte() {
    constexpr int wholeByte = 8;
    if (lastWasWrite != 1 || pendingBits == 0) return 0;
    unsigned char byte = carryValue;
    if (pendingBits != wholeByte) {
        unsigned char current = 0;
        if (stream->GetCurrentByteInStream(&current) != 0) return 1;
        const int kept = current & bitsLeftAlone(pendingBits, bitOrder);
        byte = static_cast<unsigned char>(kept | carryValue);
    }
    errno = 0;
    return stream->PutNElements(1, &byte, 1) == 1 ? 0 : 1;
}

int CarryByte::fiPkWriteCarryByte() {
    lastWasWrite = 1;
    return WriteCarryByte();
}

bool CarryByte::SameOperation(bool isRead) const {
    return lastWasWrite == (isRead ? 0 : 1);
}

void CarryByte::ResetCarryByte(bool isRead, int dataSizeType) {
    pendingBits = 0;
    carryValue = 0;
    lastWasWrite = isRead ? 0 : 1;
    bitOrder = vxDataSizeEndian(dataSizeType);
}

bool CarryByte::CheckCarryByte(int bitTransfer, int dataSizeType, bool isRead) {
    if (bitTransfer == 0) {
        if (active) active = WriteCarryByte() != 0;
        return !active;
    }
    if (active) {
        const bool sameOrder = bitOrder == vxDataSizeEndian(dataSizeType);
        if (sameOrder && SameOperation(isRead)) return true;
        // Only the bits of a write are written; those left over from a read are dropped.
        if (WriteCarryByte() != 0) return false;
    }
    ResetCarryByte(isRead, dataSizeType);
    return true;
}

int CarryByte::FseekHandleCarryByte() {
    if (!active || lastWasWrite == 0 || pendingBits == 0) {
        pendingBits = 0;
        return 0;
    }
    if (WriteCarryByte() != 0) return 1;
    pendingBits = 0;
    carryValue = 0;
    errno = 0;
    long position = 0;
    const int status = stream->getPosition(position);
    if (status != 0 || position < 1) return status;
    // A seek relative to here counts from the byte written in part.
    return stream->setPosition(position - 1);
}

void CarryByte::CheckFeofCarryByte() {
    if (active && pendingBits != 0 && !stream->EndOfData()) stream->clearError();
}

int CarryByte::FlushAndResetCarryByte() {
    if (active && WriteCarryByte() != 0) return 1;
    active = false;
    return 0;
}

}  // namespace Orvandeil::FileIO
