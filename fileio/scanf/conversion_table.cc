#include "fileio/scanf/conversion_table.h"

#include "fileio/scanf/fin_format_pieces.h"

#include <array>
#include <iterator>

namespace Orvandeil::FileIO::detail {
namespace {

template <class Piece>
finFormatPiece* create(finFormatPieceList& pieces, const finFormatPieceInitBlock& init) {
    return &pieces.emplace<Piece>(init);
}

// Only 64-bit integers are read into a class of their own; everything else ends up as a double.
template <template <class> class Functor>
consteval ScanConversion signedRow(FORMAT format, const char* letters) {
    return {format,
            letters,
            {create<finFormatPieceT<Functor<int>, vxDOUBLE_CLASS>>,
             create<finFormatPieceT<Functor<short>, vxDOUBLE_CLASS>>,
             create<finFormatPieceT<Functor<long long>, vxINT64_CLASS>>}};
}

template <template <class> class Functor>
consteval ScanConversion unsignedRow(FORMAT format, const char* letters) {
    return {format,
            letters,
            {create<finFormatPieceT<Functor<unsigned int>, vxDOUBLE_CLASS>>,
             create<finFormatPieceT<Functor<unsigned short>, vxDOUBLE_CLASS>>,
             create<finFormatPieceT<Functor<unsigned long long>, vxUINT64_CLASS>>}};
}

using FloatPiece = finFormatPieceT<FloatReadingFunctor<double>, vxDOUBLE_CLASS>;
using ShortFloatPiece = finFormatPieceT<FloatReadingFunctor<float>, vxDOUBLE_CLASS>;

constexpr ScanConversion conversions[] = {
    signedRow<IntegerReadingFunctor>(FORMAT::Integer, "d"),
    signedRow<IntegerCouldBeHexReadingFunctor>(FORMAT::IntegerOrHex, "i"),
    unsignedRow<UnsignedIntegerReadingFunctor>(FORMAT::Unsigned, "u"),
    unsignedRow<HexReadingFunctor>(FORMAT::Hex, "xX"),
    unsignedRow<OctalReadingFunctor>(FORMAT::Octal, "o"),
    {FORMAT::Float, "efgEG", {create<FloatPiece>, create<ShortFloatPiece>, create<FloatPiece>}},
    {FORMAT::String, "s", {create<finFormatPieceS>, nullptr, nullptr}},
    {FORMAT::Char, "c", {create<finFormatPieceC>, nullptr, nullptr}},
};

// The rows by letter, counted from 1.
consteval std::array<unsigned char, 128> makeRows() {
    std::array<unsigned char, 128> rows{};
    for (unsigned char i = 0; i < std::size(conversions); ++i) {
        for (const char* letter = conversions[i].letters; *letter != 0; ++letter)
            rows[static_cast<unsigned char>(*letter)] = static_cast<unsigned char>(i + 1);
    }
    return rows;
}
constexpr std::array<unsigned char, 128> rowOfLetter = makeRows();

}  // namespace

const ScanConversion* findScanConversion(char16_t letter) {
    const unsigned row = letter < rowOfLetter.size() ? rowOfLetter[letter] : 0U;
    return row == 0 ? nullptr : &conversions[row - 1];
}

}  // namespace Orvandeil::FileIO::detail
