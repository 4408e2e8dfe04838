#include "fileio/scanf/scan_control.h"

#include "fileio/scanf/scan_program.h"

#include <limits>
#include <optional>
#include <typeinfo>

namespace Orvandeil::FileIO {
namespace {

// So few values do not repay a program.
[[maybe_unused]] constexpr unsigned long fewValues = 4;

}  // namespace

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
    [[maybe_unused]] std::optional<detail::ScanProgram> program;
    while (isWanting()) {
#ifdef FILEIO_FAST_PATHS
        if (*count > fewValues && typeid(*this) == typeid(scanControl)) {
            if (!program) program.emplace(*parser, *input);
            runProgram(*program);
            wrapped = parser->isRecycled();
            if (!isWanting()) break;
        }
#endif
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

#ifdef FILEIO_FAST_PATHS
// Into memory that is there: a piece asks for more, so that it alone fails for want of it.
void scanControl::runProgram(const detail::ScanProgram& program) {
    std::size_t room = buffer->getFreeRoom();
    if (room == 0) return;
    auto* const elements = static_cast<char*>(buffer->Allocate(room));
    const unsigned long wanted =
        unlimited ? std::numeric_limits<unsigned long>::max() : limit - *count;
    const detail::ScanProgram::Run run =
        program.run(parser->getNextIndex(), wanted, {elements, room});
    buffer->SetLastChunkSize(run.elements);
    if (run.pieces == 0) return;
    *count += run.values;
    conversions += run.pieces;
    error = 0;
    parser->goOnWith(run.nextPiece, run.recycled);
    int status = 0;
    piece = parser->fiPkGetScanFormatPiece(run.nextPiece - 1, status);
}
#endif

// Text behind the last value belongs to it, up to the end of the format.
void scanControl::performTrailingLiterals() {
    while (parser->getNextIndex() != parser->getPieceCount()) {
        if (!takePiece() || !piece->isLiteral() || !performScan(*buffer)) return;
    }
}

}  // namespace Orvandeil::FileIO
