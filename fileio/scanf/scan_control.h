#pragma once

#include "fileio/export.h"
#include "fileio/scanf/fin_format_parser.h"

namespace Orvandeil::FileIO {

namespace detail {
class ScanProgram;
}

// Runs an input format over a stream, as often as its data last, until the values asked for are
// stored, the data end, the input does not match, or the format stores nothing at all.
class FILEIO_API scanControl {
public:
    // `limit` is the number of values wanted: the product of the size asked for, 0 for an unlimited
    // one. `count`, the caller's running count, goes up by one for a number, a word and a run of
    // characters alike. The parser has its pieces, the buffer its result class; all of them outlive
    // the object.
    scanControl(unsigned long limit, bool unlimited, unsigned long& count, TcodnStream& input,
                finFormatParser& parser, OutputBuffer& buffer);
    scanControl(const scanControl&) = delete;
    scanControl& operator=(const scanControl&) = delete;

    // Passed on to every piece. A host may override it for pieces of its own.
    virtual bool pieceFlag(OutputBuffer& buffer);

    // Runs the piece taken last; false when it failed, with its reason in getError().
    bool performScan(OutputBuffer& result);

    // The whole scan. True when it ended as it should: the values are there, or the format came
    // round without storing anything; after a failing piece, and always when the size was
    // unlimited, whether the format came round. getError() tells how the data ended.
    bool performMainScan();

    // The reason of the last piece when it failed, else 0. Literals behind the last value count:
    // they are read too, and may fail although every value is there.
    int getError() const { return error; }
    // The pieces that were run with success.
    unsigned long getConversions() const { return conversions; }

private:
    friend struct LayoutProbe;

    bool isWanting() const { return *count < limit || unlimited; }
    bool takePiece();
    void runProgram(const detail::ScanProgram& program);
    void performTrailingLiterals();

    unsigned long limit;
    bool unlimited;
    finFormatPiece* piece = nullptr;
    unsigned long* count;
    TcodnStream* input;
    finFormatParser* parser;
    OutputBuffer* buffer;
    unsigned long conversions = 0;
    int error = 0;
};

}  // namespace Orvandeil::FileIO
