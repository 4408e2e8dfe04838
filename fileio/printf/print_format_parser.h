#pragma once

#include "fileio/export.h"
#include "fileio/memory_operation_overloads.h"
#include "fileio/printf/conversion_token.h"
#include "fileio/printf/fout_format_piece.h"
#include "fileio/printf/vocabulary.h"

#include <span>
#include <string>
#include <string_view>

#include <boost/container/small_vector.hpp>

namespace Orvandeil::FileIO {

// Splits an output format, escapes already converted, into pieces: literal runs and conversions.
// It knows neither arguments nor output. A malformed conversion ends the parse but is reported only
// when the pieces before it are used up, so that everything in front of it is still printed.
class FILEIO_API PrintFormatParser : public fiMemoryOperationOverloads {
public:
    enum PrintFormatArgumentType : int {
        ArgumentsNone = 0,  // no conversion has referred to an argument
        ArgumentsSequential = 1,
        ArgumentsNumbered = 2
    };

    // With `forceSign` every number gets a sign and widths are dropped, their "*" included. Never
    // throws for a bad format.
    PrintFormatParser(std::u16string format, bool forceSign);
    PrintFormatParser(const PrintFormatParser&) = delete;
    PrintFormatParser& operator=(const PrintFormatParser&) = delete;
    virtual ~PrintFormatParser();

    // The next piece, owned by the parser; null behind the last one. Where an error was recorded,
    // its code is thrown as an int instead.
    foutFormatPiece* getNextPrintFormatPiece();

    // Starts over with the first piece. A numbered format is used only once: nothing happens.
    void resetParser();

    // Whether the last conversion is left-justified and only breakable space follows it.
    bool trailingWhitespaceIsLeftJustification() const;

    // Writes the format as it stands, from the place of the piece last returned to its end. Throws
    // the stream's code as an int after a short write, std::out_of_range when no piece was taken.
    void printRemainingFormatAsLiteral(TcodnStream* out) const;

    // All pieces of the format, in order, and what each of them is made from. They are made when
    // they are first asked for.
    std::span<foutFormatPiece* const> getPieces();
    std::span<const foutFormatPieceInitBlock> getInitBlocks() const {
        return {blocks.data(), blocks.size()};
    }
    // Goes on as if the pieces before `index` had been handed out, and the one before it last.
    void goOnWith(unsigned long index) { nextPiece = index; }
    unsigned long getNextIndex() const { return nextPiece; }

    PrintFormatArgumentType getArgumentType() const { return argumentType; }
    // The conversions other than "%%", and the "*" that take the next argument.
    unsigned long getConversionCount() const { return conversionCount; }
    bool getHasStringConversion() const { return hasStringConversion; }
    // 0, or the code of the first malformed conversion.
    int getRecordedError() const { return recordedError; }

private:
    friend struct LayoutProbe;

    void parse();
    std::size_t parseConversion(std::size_t position);
    bool specialCasePercent();
    void extractNumberedArgPart();
    void extractFlagsPart();
    void extractWidthPart();
    void extractPrecisionPart();
    void extractSubFormatPart();
    void extractFormatPart();
    // What the "*" of a width or precision refers to, `digits` being the text behind it.
    WidthPrecisionFieldType extractReference(std::u16string_view digits, int& number);
    void setArgumentType(PrintFormatArgumentType type);
    void beginPiece(unsigned long position);
    void pushLiteral(std::size_t from, std::size_t to, std::size_t position);
    void recordInvalidFormat();

    std::u16string formatText;
    const char16_t* formatCharacters;
    bool forceSign;
    unsigned long conversionCount = 0;
    bool hasStringConversion = false;
    bool lastLeftJustified = false;
    const char16_t* trailingLiteral = nullptr;

    foutFormatPieceInitBlock* piece = nullptr;  // under construction: the last block
    const detail::ConversionToken* match = nullptr;

    PrintFormatArgumentType argumentType = ArgumentsNone;
    foutFormatPieceList pieces;
    unsigned long nextPiece = 0;
    int recordedError = 0;
    boost::container::small_vector<foutFormatPieceInitBlock, 8> blocks;
};

}  // namespace Orvandeil::FileIO
