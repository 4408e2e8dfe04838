#pragma once

#include "fileio/export.h"
#include "fileio/memory_operation_overloads.h"
#include "fileio/scanf/fin_format_piece.h"

#include <optional>
#include <string>
#include <string_view>

namespace Orvandeil::FileIO {

namespace detail {
struct ScanConversion;
}

// Splits an input format into pieces, chooses the class of the result, and hands the pieces out in
// order, over and over. A format error ends the parse and becomes the last piece, so that
// everything in front of it is still read.
//
//   literal run ("%%" is a "%")
//   % [*] [width] [h|l] one of d i u x X o e f g E G
//   % [*] [width] one of s c [set]
class FILEIO_API finFormatParser : public fiMemoryOperationOverloads {
public:
    // `format` ends with a NUL and stays alive until InitFormatPieces has returned. `input` is what
    // the pieces will read; null when they are only looked at.
    finFormatParser(const char16_t* format, TcodnStream* input);
    finFormatParser(const finFormatParser&) = delete;
    finFormatParser& operator=(const finFormatParser&) = delete;
    ~finFormatParser();

    // To be called once, before anything else. Never throws for a bad format. The result's class
    // depends on the order of the conversions: the first that is none of text sets it, and any
    // later one of another class, text included, makes it double.
    void InitFormatPieces();

    // The next piece, owned by the parser, with its full width; the first one again behind the
    // last.
    finFormatPiece* fiPkGetNextScanFormatPiece(int& status);
    // Piece `index`. Status 0, or 45 and null when there is none.
    finFormatPiece* fiPkGetScanFormatPiece(std::size_t index, int& status);

    // Goes on as if the pieces before `index` had been handed out, in a new round when `wrapped`.
    void goOnWith(std::size_t index, bool wrapped) {
        nextIndex = index;
        recycled = recycled || wrapped;
    }

    TcodnStream* getInput() const { return input; }
    std::size_t getPieceCount() const { return pieces.size(); }
    std::size_t getNextIndex() const { return nextIndex; }
    // Whether the pieces have been handed out more than once.
    bool isRecycled() const { return recycled; }
    vxClassID getResultClass() const { return resultClass; }
    // 0, or the code of the format error.
    int getError() const { return error; }

private:
    friend struct LayoutProbe;
    using Piece = finFormatPiece*;  // in the list; null when there is none
    enum class State { NothingSeen, LiteralSeen };
    // What stands between "%" and the conversion letter.
    struct Field {
        const char16_t* asterisk = nullptr;  // null: not suppressed
        int width = -1;
    };

    Piece fiPkCreateNextScanFormatPiece();
    Piece parsePercentInFormat(State state);
    Piece parseDoublePercent();
    Piece FinParseConversionPart();
    std::optional<Field> CheckForAsteriskAndFieldWidth();
    Piece parseScansetConversion(const Field& field);
    SUB_FORMAT parseSubFormat();
    Piece parseFormat(SUB_FORMAT sub, const Field& field);
    Piece createNewFormatPiece(const detail::ScanConversion& conversion, SUB_FORMAT sub,
                               const Field& field);
    Piece createLiteralFormatPiece();
    Piece parseEndOfFormat(State state);
    Piece recordError(int code);
    void addResultClass(const finFormatPiece& piece);
    std::u16string_view takePieceText(const Field& field, std::u16string& joined);

    TcodnStream* input;
    const char16_t* pieceStart;
    const char16_t* cursor;
    bool recycled = false;
    finFormatPieceList pieces;
    std::size_t nextIndex = 0;
    vxClassID resultClass = vxCHAR_CLASS;
    int error = 0;
};

}  // namespace Orvandeil::FileIO
