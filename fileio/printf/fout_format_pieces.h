#pragma once

#include "fileio/printf/fout_format_piece.h"

#include <cstddef>
#include <string>
#include <string_view>

namespace Orvandeil::FileIO {

// A run of text between conversions, and "%%".
class FILEIO_API foutFormatPieceForLiterals : public foutFormatPiece {
public:
    explicit foutFormatPieceForLiterals(const foutFormatPieceInitBlock& init);

    bool consumesData() const override { return false; }
    void printByType(TcodnStream* out, printfArgumentSource* source) override;
    unsigned long getBufferSize() const override { return text.size(); }
    Printability decidePrintMode(printfArgumentSource* source) const override;

    std::u16string_view getText() const { return text; }

private:
    std::u16string_view text;  // of the format, which outlives the piece
};

// The text of a literal piece; empty for a conversion.
FILEIO_API std::u16string_view literalTextOf(const foutFormatPiece& piece);

// Whole numbers of T, long or unsigned long: d i, and o u x X.
template <class T>
class FILEIO_API foutFormatPieceForInteger : public foutFormatPiece {
public:
    using foutFormatPiece::foutFormatPiece;

    bool isUnsigned() const override { return std::is_unsigned_v<T>; }
    void printByType(TcodnStream* out, printfArgumentSource* source) override;
    Printability decidePrintMode(printfArgumentSource* source) const override;
};

// e E f g G
class FILEIO_API foutFormatPieceForDouble : public foutFormatPiece {
public:
    using foutFormatPiece::foutFormatPiece;

    void printByType(TcodnStream* out, printfArgumentSource* source) override;
    Printability decidePrintMode(printfArgumentSource* source) const override;
};

// A whole char array, the run of numbers that are character codes, or one text of an object.
class FILEIO_API foutFormatPieceForS : public foutFormatPiece {
public:
    using foutFormatPiece::foutFormatPiece;

    void printByType(TcodnStream* out, printfArgumentSource* source) override;
    Printability decidePrintMode(printfArgumentSource* source) const override;

private:
    std::u16string scratch;
};

// One character.
class FILEIO_API foutFormatPieceForC : public foutFormatPiece {
public:
    using foutFormatPiece::foutFormatPiece;

    void printByType(TcodnStream* out, printfArgumentSource* source) override;
    Printability decidePrintMode(printfArgumentSource* source) const override;
};

// The bits of a value stored as F, read as the unsigned integer U of the same size (IEEE 754).
template <class U, class F>
class FILEIO_API foutFormatPieceForOUXbt : public foutFormatPiece {
public:
    using foutFormatPiece::foutFormatPiece;

    bool isUnsigned() const override { return true; }
    void printByType(TcodnStream* out, printfArgumentSource* source) override;
    Printability decidePrintMode(printfArgumentSource* source) const override;

    // Writes the bits with all leading zeros and a terminator into `digits`, which has room for
    // maxDigits + 1 characters. Returns the digits that there must be; throws InternalError when
    // there are others.
    virtual unsigned long formatBitPattern(U bits, char* digits) const = 0;
    // The length that the digits are filled up to with zeros.
    virtual unsigned long getDigitFieldLength(unsigned long digits) const;
    // Writes what "#" puts in front, and returns its length.
    virtual unsigned long writePrefix(char* out) const;

    static constexpr std::size_t maxDigits = 22;
    static constexpr std::size_t maxPrefix = 2;

protected:
    bool isZeroFilled() const;
};

template <class U, class F>
class FILEIO_API foutFormatPieceForObt : public foutFormatPieceForOUXbt<U, F> {
public:
    using foutFormatPieceForOUXbt<U, F>::foutFormatPieceForOUXbt;
    unsigned long formatBitPattern(U bits, char* digits) const override;
    unsigned long getDigitFieldLength(unsigned long digits) const override;
};

template <class U, class F>
class FILEIO_API foutFormatPieceForUbt : public foutFormatPieceForOUXbt<U, F> {
public:
    using foutFormatPieceForOUXbt<U, F>::foutFormatPieceForOUXbt;
    unsigned long formatBitPattern(U bits, char* digits) const override;
};

template <class U, class F>
class FILEIO_API foutFormatPieceForXbt : public foutFormatPieceForOUXbt<U, F> {
public:
    explicit foutFormatPieceForXbt(const foutFormatPieceInitBlock& init);
    unsigned long formatBitPattern(U bits, char* digits) const override;
    unsigned long writePrefix(char* out) const override;

private:
    bool upperCase;
};

}  // namespace Orvandeil::FileIO
