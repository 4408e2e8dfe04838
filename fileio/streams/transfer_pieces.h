#pragma once

#include "fileio/constants.h"

#include <algorithm>
#include <cerrno>

namespace Orvandeil::FileIO::detail {

// The whole elements that one standard-library call moves; at least one.
inline unsigned long elementsPerPiece(unsigned long elementSize) {
    return std::max(1UL, constants::transferPieceBytes / elementSize);
}

// Moves `count` elements in pieces, calling transfer(elements done, elements wanted) until all are
// moved or a call comes up short. Returns the elements moved; errno is the last call's.
template <class Transfer>
unsigned long transferInPieces(unsigned long count, unsigned long elementSize, Transfer transfer) {
    const unsigned long piece = elementsPerPiece(elementSize);
    unsigned long done = 0;
    unsigned long wanted = 0;
    unsigned long moved = 0;
    while (done < count && moved == wanted) {
        wanted = std::min(count - done, piece);
        errno = 0;
        moved = transfer(done, wanted);
        done += moved;
    }
    return done;
}

}  // namespace Orvandeil::FileIO::detail
