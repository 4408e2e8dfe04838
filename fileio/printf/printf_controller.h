#pragma once

#include "fileio/export.h"
#include "fileio/memory_operation_overloads.h"
#include "fileio/printf/print_format_parser.h"
#include "fileio/printf/printf_argument_source.h"

#include <string>
#include <variant>

namespace Orvandeil::FileIO {

// One call of formatted output: prints the pieces of a format to a stream, again and again while
// argument data remains. Stream and arrays are not owned and outlive the controller.
class FILEIO_API printfController : public fiMemoryOperationOverloads {
public:
    // Never fails for a bad format; doPrintf tells. Raises what the "size" of an object raises.
    printfController(std::u16string format, TcodnStream* out, const vxArray** args, int count);
    printfController(const printfController&) = delete;
    printfController& operator=(const printfController&) = delete;
    ~printfController();

    // Prints everything. True when the output is complete. False when it failed: getErrorCode()
    // is then a code of the library or of the stream, and it may be 0 when a stream wrote short
    // without a cause. What was written before stays written. NotEnoughArgs tells that the data
    // ended within the format, which hosts take for an ordinary end. Errors that the host raises
    // pass through.
    bool doPrintf();

    int getErrorCode() const { return errorCode; }
    const PrintFormatParser& getParser() const { return parser; }
    // The piece that was being printed; null before the first.
    const foutFormatPiece* getCurrentPiece() const {
        settleCurrentPiece();
        return currentPiece;
    }

private:
    friend struct LayoutProbe;

    printfArgumentSource* makeSource(const vxArray** args, std::size_t count);
    void printAllPasses();
    void printFurtherPasses();
    bool printPass();
    bool printCollected();
    bool endPass();
    void settleCurrentPiece() const;
    bool isOutOfData() const;
    bool takePiece();

    int errorCode = 0;
    mutable PrintFormatParser parser;  // makes its pieces when they are looked at
    printfArgumentSource* source;
    mutable foutFormatPiece* currentPiece = nullptr;
    TcodnStream* output;
    bool complete = false;
    mutable bool isCurrentUnmade = false;  // the piece that was handed out last is current
    std::variant<std::monostate, printfSequentialArgumentSource, printfNumberedArgumentSource>
        ownSource;
};

}  // namespace Orvandeil::FileIO
