#include "fileio/scanf/scan_control.h"

namespace Orvandeil::FileIO {

scanControl::scanControl(unsigned long valuesWanted, bool toTheEnd, unsigned long& valueCount,
                         TcodnStream& readFrom, finFormatParser& formatParser, OutputBuffer& result)
    : limit(valuesWanted),
      unlimited(toTheEnd),
      count(&valueCount),
      input(&readFrom),
      parser(&formatParser),
      buffer(&result) {}

bool scanControl::pieceFlag(OutputBuffer& /*buffer*/) {
    return false;
}

bool scanControl::performScan(OutputBuffer& result) {
    bool failed = false;
    int status = 0;
    const unsigned long values = piece->scan(*input, result, pieceFlag(result), failed, status);
    if (failed) {
        error = status;
        return false;
    }
    *count += values;
    ++conversions;
    error = 0;
    return true;
}

bool scanControl::takePiece() {
    int status = 0;
    piece = parser->fiPkGetNextScanFormatPiece(status);
    if (!piece) error = status;
    return piece != nullptr;
}

bool scanControl::performMainScan() {
    bool wrapped = false;
    unsigned long idle = 0;  // conversions that went well while there was no value yet
    const bool unlimitedAtStart = unlimited;
    while (*count < limit || unlimited) {
        if (!takePiece()) return wrapped;
        if (parser->isRecycled()) {
            wrapped = true;
            // The test is one of equality on purpose: a round of suppressed conversions that is
            // past the limit goes on to the end of the data.
            if (*count == 0 && (idle == 0 || idle == limit)) return true;
        }
        if (!performScan(*buffer)) return wrapped;
        if (*count == 0 && !piece->isLiteral()) ++idle;
    }
    if (unlimitedAtStart) return wrapped;
    performTrailingLiterals();
    return true;
}

// Text behind the last value belongs to it, up to the end of the format.
void scanControl::performTrailingLiterals() {
    while (parser->getNextIndex() != parser->getPieceCount()) {
        if (!takePiece() || !piece->isLiteral() || !performScan(*buffer)) return;
    }
}

}  // namespace Orvandeil::FileIO
