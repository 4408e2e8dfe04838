#include "cli/format_place.h"

#include "fileio/host/text.h"
#include "fileio/printf/fout_format_pieces.h"
#include "fileio/printf/print_format_parser.h"
#include "fileio/scanf/fin_format_parser.h"

#include <algorithm>

namespace cli {

using Orvandeil::FileIO::finFormatParser;
using Orvandeil::FileIO::finFormatPiece;
using Orvandeil::FileIO::foutFormatPiece;
using Orvandeil::FileIO::PrintFormatParser;

namespace {

std::string narrowed(std::u16string_view text) {
    return vxTextToNarrow(text.data(), text.size());
}

// The conversion at `start`, with the character that spoils it where there is one.
std::u16string_view conversionAt(std::u16string_view format, std::size_t start) {
    constexpr std::u16string_view inner = u"0123456789$-+ #.*hlbt";
    std::size_t end = std::min(format.find_first_not_of(inner, start + 1), format.size());
    if (end < format.size()) ++end;
    if (end < format.size() && (format[end] & 0xFC00) == 0xDC00) ++end;
    return format.substr(start, end - start);
}

// Where the text behind a piece begins; a literal in front of a "%" knows only that "%".
std::size_t endOf(std::u16string_view format, const foutFormatPiece& piece) {
    const std::size_t position = piece.getFormatPosition();
    if (piece.getConversion() != Orvandeil::FileIO::NoConversion) {
        return format.find(u'%', position + 1);
    }
    return literalTextOf(piece) == u"%" ? position + 2 : position;
}

}  // namespace

std::string placeAt(std::u16string_view format, std::size_t start) {
    if (start >= format.size()) return {};
    const auto isTrailing = [](char16_t unit) { return (unit & 0xFC00) == 0xDC00; };
    const auto before = format.substr(0, start);
    const auto column =
        1 + before.size() - static_cast<std::size_t>(std::ranges::count_if(before, isTrailing));
    return '"' + narrowed(conversionAt(format, start)) + "\", column " + std::to_string(column) +
           " of the format";
}

std::string escaped(std::u16string_view text) {
    constexpr char16_t controls[] = u"\a\b\t\n\v\f\r\\";
    constexpr char letters[] = "abtnvfr\\";
    std::u16string shown;
    for (const char16_t unit : text) {
        const auto index = std::u16string_view(controls).find(unit);
        if (index != std::u16string_view::npos) {
            shown += u'\\';
            shown += static_cast<char16_t>(letters[index]);
        } else {
            shown += unit < u' ' ? u'?' : unit;
        }
    }
    return narrowed(shown);
}

std::string quoted(std::u16string_view text) {
    return '"' + escaped(text) + '"';
}

std::string malformedPlace(const std::u16string& format) {
    PrintFormatParser parser(format, false);
    std::size_t end = format.find(u'%');
    try {
        while (const foutFormatPiece* piece = parser.getNextPrintFormatPiece())
            end = endOf(format, *piece);
    } catch (int) {
        return placeAt(format, end);
    }
    return {};
}

std::string malformedScanPlace(const std::u16string& format) {
    finFormatParser parser(format.c_str(), nullptr);
    parser.InitFormatPieces();
    if (parser.getError() == 0) return {};
    int status = 0;
    const finFormatPiece* rest = parser.fiPkGetScanFormatPiece(parser.getPieceCount() - 1, status);
    return placeAt(format, format.size() - rest->getText().size());
}

std::string pieceText(std::u16string_view format, const foutFormatPiece& piece) {
    return narrowed(conversionAt(format, piece.getFormatPosition()));
}

std::string piecePlace(std::u16string_view format, const foutFormatPiece* piece) {
    const bool isConversion =
        piece != nullptr && piece->getConversion() != Orvandeil::FileIO::NoConversion;
    return isConversion ? placeAt(format, piece->getFormatPosition()) : std::string();
}

}  // namespace cli
