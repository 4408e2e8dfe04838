#pragma once

#include "fileio/export.h"
#include "fileio/memory_operation_overloads.h"

namespace Orvandeil::FileIO {

class fileStream;

// The byte that a transfer of bit fields has used in part, one per file. Whoever moves the bits
// keeps `carryValue` and `pendingBits` up to date and sets `active` once CheckCarryByte has agreed
// to a bit transfer; this class decides when the bits are written out, dropped or kept.
//
// Results are 0 for success and 1 for failure, the cause being in the stream's error code, unless
// said otherwise.
class FILEIO_API CarryByte : public fiMemoryOperationOverloads {
public:
    explicit CarryByte(fileStream* owner);
    CarryByte(const CarryByte&) = delete;
    CarryByte& operator=(const CarryByte&) = delete;
    virtual ~CarryByte();

    // Writes the pending bits of a write, merged with the bits of the file's byte that they leave.
    // The fields stay as they are.
    int WriteCarryByte();
    // The same, whatever the direction was.
    int fiPkWriteCarryByte();

    // Whether a transfer in that direction continues the one in progress.
    bool SameOperation(bool isRead) const;
    void ResetCarryByte(bool isRead, int dataSizeType);

    // Called before every read or write; `bitTransfer` is non-zero for bit fields. False when bits
    // could not be settled: the transfer must not go on.
    bool CheckCarryByte(int bitTransfer, int dataSizeType, bool isRead);

    // Called before a seek: settles the bits and, after a write, steps back onto their byte. Else
    // the status of the failed positioning.
    int FseekHandleCarryByte();
    // Called before the end of the file is asked for.
    void CheckFeofCarryByte();
    // Called before the file is closed or flushed on demand.
    int FlushAndResetCarryByte();

    bool active = false;           // a bit transfer is in progress
    unsigned char carryValue = 0;  // the bits, at their places in the byte
    int pendingBits = 0;           // how many of them count, 0 to 8
    int lastWasWrite = 0;          // the direction of the bit transfer
    int bitOrder = 0;              // 1: bytes fill from the high end, else from the low end

private:
    friend struct LayoutProbe;

    fileStream* stream;
};

}  // namespace Orvandeil::FileIO
