#include "fileio/streams/file_stream.h"
#include "fileio/streams/transfer_pieces.h"

#include <algorithm>

namespace Orvandeil::FileIO {
namespace {

// The whole elements that a file still holds, as far as it can tell; else 0.
std::size_t elementsLeft(std::FILE* file, unsigned long elementSize) {
    long size = 0;
    fileStream::getFileSize(file, size);
    const off_t position = ftello(file);
    if (position < 0 || position >= size) return 0;
    return static_cast<std::size_t>(size - position) / elementSize;
}

}  // namespace

// How many elements to make room for when more are wanted than one piece holds: one more than the
// file has, so that the read that meets its end needs no chunk of its own.
std::size_t fileStream::roomForRead(OutputBuffer& buffer, unsigned long elementSize,
                                    bool lastCameShort) const {
    if (lastCameShort) return 1;
    const std::size_t left = elementsLeft(file, elementSize);
    if (left != 0) return left + 1;
    return std::max(buffer.SetCurrentCapacity(0, true), detail::elementsPerPiece(elementSize));
}

unsigned long fileStream::readInto(OutputBuffer& buffer, std::size_t& room,
                                   unsigned long elementSize) {
    auto* const place = static_cast<char*>(buffer.Allocate(room));
    const unsigned long count = GetNElements(room, place, elementSize);
    buffer.SetLastChunkSize(count);
    return count;
}

unsigned long fileStream::GetNElements(unsigned long count, OutputBuffer& buffer,
                                       unsigned long elementSize) {
    if (elementSize == 0) return 0;
    const unsigned long piece = detail::elementsPerPiece(elementSize);
    unsigned long total = 0;
    unsigned long got = 1;
    std::size_t room = 1;
    while (total < count && got != 0) {
        const unsigned long wanted = count - total;
        const bool cameShort = got < room;
        room = wanted <= piece ? wanted
                               : std::min(wanted, roomForRead(buffer, elementSize, cameShort));
        got = readInto(buffer, room, elementSize);
        total += got;
    }
    return total;
}

unsigned long fileStream::GetNElements(OutputBuffer& buffer, unsigned long elementSize) {
    if (elementSize == 0) return 0;
    unsigned long total = 0;
    unsigned long got = 0;
    std::size_t room = 0;
    do {
        room = roomForRead(buffer, elementSize, false);
        got = readInto(buffer, room, elementSize);
        total += got;
    } while (got == room);
    return total;
}

}  // namespace Orvandeil::FileIO
