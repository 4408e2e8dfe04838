#include "fileio/printf/collected_text.h"

#ifdef FILEIO_FAST_PATHS

#include "fileio/printf/fout_format_pieces.h"
#include "fileio/printf/number_text.h"
#include "fileio/printf/printf_argument_source.h"
#include "fileio/text/known_streams.h"

#include <algorithm>
#include <cstring>
#include <utility>

namespace Orvandeil::FileIO::detail {
namespace {

constexpr std::size_t mostPieces = 8;
static_assert(sizeof(foutFormatPieceForLiterals) >= sizeof(foutFormatPieceForDouble));
static_assert(sizeof(foutFormatPieceForLiterals) >= sizeof(foutFormatPieceForInteger<long>));
static_assert(foutFormatPieceList::roomFor<foutFormatPieceForLiterals> >= mostPieces);

// Longer ones gain nothing.
constexpr std::size_t longestLiteral = 64;

bool isPlain(const foutFormatPieceInitBlock& piece) {
    if (piece.conversion == NoConversion) return piece.written.size() <= longestLiteral;
    return piece.conversion <= ConvG && piece.subformat <= SubL && piece.numberedIndex == 0 &&
           piece.widthKind <= FieldAbsent && piece.precisionKind <= FieldAbsent;
}

}  // namespace

bool CollectedText::suits(Blocks format) {
    return format.size() <= mostPieces && std::ranges::all_of(format, isPlain);
}

CollectedText::CollectedText(TcodnStream& out)
    : string(exactly<outputStringStream>(out)), output(out) {
    if (!output.keepsUnits() || !writesAsPrintf()) string = nullptr;
}

bool CollectedText::take(const foutFormatPieceInitBlock& piece, printfArgumentSource& source) {
    return piece.conversion == NoConversion ? takeLiteral(piece.written)
                                            : takeNumber(piece, source);
}

bool CollectedText::takeLiteral(std::u16string_view text) {
    if (room() < text.size()) flush();
    char* out = end;
    unsigned seen = 0;
    for (const char16_t unit : text) {
        seen |= unit;
        *out++ = static_cast<char>(unit);
    }
    if (seen >= 0x80) return false;
    keep(out);
    return true;
}

bool CollectedText::takeNumber(const foutFormatPieceInitBlock& piece,
                               printfArgumentSource& source) {
    if (!source.hasPlainElement()) return false;
    const NumberForm form =
        makeNumberForm(static_cast<char>(piece.written.back()), piece.flags, piece.width,
                       piece.precisionKind == FieldLiteral, piece.precision);
    if (!isKnownForm(form) || form.mostBytes > block.size()) return false;
    if (room() < form.mostBytes) flush();
    switch (piece.conversion) {
        case ConvD:
        case ConvI:
            return takeAs<long>(form, source);
        case ConvO:
        case ConvU:
        case ConvX:
            return takeAs<unsigned long>(form, source);
        default:
            return takeAs<double>(form, source);
    }
}

template <class T>
bool CollectedText::takeAs(const NumberForm& form, printfArgumentSource& source) {
    if (source.checkPrintabilityByType<T>() != Printable) return false;
    // The step to the next argument, which may be an object, comes before the value is written.
    const T value = source.getCurrentArgumentAs<T>();
    keep(writeNumber(end, form, value));
    return true;
}

void CollectedText::keep(const char* newEnd) {
    const auto added = static_cast<std::size_t>(newEnd - end);
    if (static_cast<std::size_t>(newEnd - block.data()) > unitsInString) {
        char* const text = end;
        flush();
        string->EnsureSpace(added * sizeof(char16_t));
        std::memmove(block.data(), text, added);
        unitsInString = output.room();
    }
    end += added;
}

void CollectedText::flush() {
    const auto count = static_cast<std::size_t>(std::exchange(end, block.data()) - block.data());
    if (count != 0) output.settle(block.data(), count);
    unitsInString = 0;
}

}  // namespace Orvandeil::FileIO::detail

#endif
