#pragma once

#include "fileio/scanf/fin_format_piece.h"

namespace Orvandeil::FileIO::detail {

// One conversion letter, or several that mean the same.
struct ScanConversion {
    using Create = finFormatPiece* (*)(finFormatPieceList&, const finFormatPieceInitBlock&);

    FORMAT format;
    const char* letters;
    Create create[3];  // by SUB_FORMAT; null where the length letter is not allowed
};

// Null when the letter is none of a conversion's.
const ScanConversion* findScanConversion(char16_t letter);

}  // namespace Orvandeil::FileIO::detail
