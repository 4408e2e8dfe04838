#pragma once

#include "fileio/scanf/fin_format_piece.h"
#include "fileio/scanf/fin_format_piece_t.h"

#include <bitset>

namespace Orvandeil::FileIO {

// What the pieces of text have in common: characters are the values that they produce.
template <class Piece, FORMAT pieceFormat>
class FILEIO_API finFormatPieceOfText : public finFormatPiece {
public:
    using finFormatPiece::finFormatPiece;

    std::unique_ptr<finFormatPiece> clone() const override {
        return std::unique_ptr<finFormatPiece>(new Piece(static_cast<const Piece&>(*this)));
    }
    vxClassID getClassID() const override { return vxCHAR_CLASS; }
    FORMAT getFormat() const override { return pieceFormat; }
};

// "%s": one word, the blanks before it skipped.
class FILEIO_API finFormatPieceS : public finFormatPieceOfText<finFormatPieceS, FORMAT::String> {
public:
    using finFormatPieceOfText::finFormatPieceOfText;
    unsigned long scan(TcodnStream& input, OutputBuffer& result, bool hostFlag, bool& failed,
                       int& status) override;
};

// "%c": as many characters as the width says, 1 without one, blanks included; fewer at the end of
// the data.
class FILEIO_API finFormatPieceC : public finFormatPieceOfText<finFormatPieceC, FORMAT::Char> {
public:
    using finFormatPieceOfText::finFormatPieceOfText;
    unsigned long scan(TcodnStream& input, OutputBuffer& result, bool hostFlag, bool& failed,
                       int& status) override;
};

// "%[...]": the characters that the set accepts (ISO C, 7.21.6.2, with ranges "x-y" in either
// order). The first other one stays unread.
class FILEIO_API finFormatPieceCMATCH
    : public finFormatPieceOfText<finFormatPieceCMATCH, FORMAT::Scanset> {
public:
    // `open` is the place of the "[" in the text, which ends with the "]" that closes the set.
    finFormatPieceCMATCH(const finFormatPieceInitBlock& init, std::size_t open);
    unsigned long scan(TcodnStream& input, OutputBuffer& result, bool hostFlag, bool& failed,
                       int& status) override;
    bool accepts(char16_t character) const;

private:
    friend struct LayoutProbe;

    bool takeMatches(TcodnStream& input, OutputBuffer& result, bool& matched);
    void answerForAscii();

    std::size_t open;
    bool asciiAnswersKnown = false;
    std::bitset<0x80> asciiAnswers;
};

// Text that the input must repeat. A blank stands for any number of blanks, "%%" for a "%".
class FILEIO_API finFormatPieceLiteral
    : public finFormatPieceOfText<finFormatPieceLiteral, FORMAT::Literal> {
public:
    // `source` must outlive every scan. It may be null for a piece that is only looked at.
    finFormatPieceLiteral(const finFormatPieceInitBlock& init, TcodnStream* source);
    bool isLiteral() const override { return true; }
    // Reads from the stream that it was made for.
    unsigned long scan(TcodnStream& input, OutputBuffer& result, bool hostFlag, bool& failed,
                       int& status) override;

private:
    friend struct LayoutProbe;

    bool takeEqual(char16_t unit);

    TcodnStream* source;
};

// A malformed rest of the format: it fails with its code, and nothing comes behind it.
class FILEIO_API finFormatPieceError
    : public finFormatPieceOfText<finFormatPieceError, FORMAT::Error> {
public:
    finFormatPieceError(const finFormatPieceInitBlock& init, int errorCode);
    unsigned long scan(TcodnStream& input, OutputBuffer& result, bool hostFlag, bool& failed,
                       int& status) override;
    int getCode() const { return code; }

private:
    friend struct LayoutProbe;

    int code;
};

}  // namespace Orvandeil::FileIO
