#include "fileio/scanf/conversion_table.h"

#include "fileio/scanf/fin_format_pieces.h"

#include <algorithm>
#include <iterator>
#include <string_view>

namespace Orvandeil::FileIO::detail {
namespace {

template <class Piece>
std::unique_ptr<finFormatPiece> create(const finFormatPieceInitBlock& init) {
    return std::make_unique<Piece>(init);
}

// Only 64-bit integers are read into a class of their own; everything else ends up as a double.
template <template <class> class Functor>
consteval ScanConversion signedRow(FORMAT format, const char16_t* letters) {
    return {format,
            letters,
            {create<finFormatPieceT<Functor<int>, vxDOUBLE_CLASS>>,
             create<finFormatPieceT<Functor<short>, vxDOUBLE_CLASS>>,
             create<finFormatPieceT<Functor<long long>, vxINT64_CLASS>>}};
}

template <template <class> class Functor>
consteval ScanConversion unsignedRow(FORMAT format, const char16_t* letters) {
    return {format,
            letters,
            {create<finFormatPieceT<Functor<unsigned int>, vxDOUBLE_CLASS>>,
             create<finFormatPieceT<Functor<unsigned short>, vxDOUBLE_CLASS>>,
             create<finFormatPieceT<Functor<unsigned long long>, vxUINT64_CLASS>>}};
}

using FloatPiece = finFormatPieceT<FloatReadingFunctor<double>, vxDOUBLE_CLASS>;
using ShortFloatPiece = finFormatPieceT<FloatReadingFunctor<float>, vxDOUBLE_CLASS>;

constexpr ScanConversion conversions[] = {
    signedRow<IntegerReadingFunctor>(FORMAT::Integer, u"d"),
    signedRow<IntegerCouldBeHexReadingFunctor>(FORMAT::IntegerOrHex, u"i"),
    unsignedRow<UnsignedIntegerReadingFunctor>(FORMAT::Unsigned, u"u"),
    unsignedRow<HexReadingFunctor>(FORMAT::Hex, u"xX"),
    unsignedRow<OctalReadingFunctor>(FORMAT::Octal, u"o"),
    {FORMAT::Float, u"efgEG", {create<FloatPiece>, create<ShortFloatPiece>, create<FloatPiece>}},
    {FORMAT::String, u"s", {create<finFormatPieceS>, nullptr, nullptr}},
    {FORMAT::Char, u"c", {create<finFormatPieceC>, nullptr, nullptr}},
};

}  // namespace

const ScanConversion* findScanConversion(char16_t letter) {
    const auto hasLetter = [letter](const ScanConversion& row) {
        return std::u16string_view(row.letters).find(letter) != std::u16string_view::npos;
    };
    const auto* found = std::find_if(std::begin(conversions), std::end(conversions), hasLetter);
    return found == std::end(conversions) ? nullptr : found;
}

const ScanConversion& scanConversion(FORMAT format) {
    return *std::find_if(std::begin(conversions), std::end(conversions),
                         [format](const ScanConversion& row) { return row.format == format; });
}

}  // namespace Orvandeil::FileIO::detail
