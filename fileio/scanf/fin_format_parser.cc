#include "fileio/scanf/fin_format_parser.h"

#include "fileio/errors/code_list.h"
#include "fileio/printf/digits.h"
#include "fileio/printf/escape_sequences.h"
#include "fileio/scanf/conversion_table.h"
#include "fileio/scanf/fin_format_pieces.h"

#include <string>
#include <utility>

namespace Orvandeil::FileIO {
namespace {

constexpr int noSuchPiece = 45;  // positive on purpose: a host shows it as a system error

// The "]" that closes the set whose first character is at `member`, or the end of the format.
const char16_t* findSetEnd(const char16_t* member) {
    if (*member == u'^') ++member;
    if (*member == u']') ++member;
    while (*member != u']' && *member != 0)
        ++member;
    return member;
}

}  // namespace

finFormatParser::finFormatParser(const char16_t* format, TcodnStream* readFrom)
    : input(readFrom), pieceStart(format), cursor(format) {}

finFormatParser::~finFormatParser() = default;

void finFormatParser::InitFormatPieces() {
    resultClass = vxCHAR_CLASS;
    do {
        const Piece piece = fiPkCreateNextScanFormatPiece();
        if (!piece) {
            pieces.emplace<finFormatPieceError>(finFormatPieceInitBlock{pieceStart}, error);
            break;
        }
        addResultClass(*piece);
    } while (*pieceStart != 0);
    nextIndex = 0;
}

void finFormatParser::addResultClass(const finFormatPiece& piece) {
    if (resultClass == vxCHAR_CLASS) {
        resultClass = piece.getClassID();
    } else if (!piece.isLiteral() && piece.getClassID() != resultClass) {
        resultClass = vxDOUBLE_CLASS;
    }
}

finFormatPiece* finFormatParser::fiPkGetNextScanFormatPiece(int& status) {
    if (nextIndex == pieces.size()) {
        nextIndex = 0;
        recycled = true;
    }
    return fiPkGetScanFormatPiece(nextIndex++, status);
}

finFormatPiece* finFormatParser::fiPkGetScanFormatPiece(std::size_t index, int& status) {
    if (index >= pieces.size()) {
        status = noSuchPiece;
        return nullptr;
    }
    status = 0;
    pieces[index]->restoreWidth();
    return pieces[index];
}

finFormatParser::Piece finFormatParser::fiPkCreateNextScanFormatPiece() {
    cursor = pieceStart;
    State state = State::NothingSeen;
    while (true) {
        for (; *cursor != u'%'; ++cursor) {
            if (*cursor == 0) return parseEndOfFormat(state);
            state = State::LiteralSeen;
        }
        const Piece piece = parsePercentInFormat(state);
        if (piece || error != 0) return piece;
    }
}

finFormatParser::Piece finFormatParser::parsePercentInFormat(State state) {
    if (state == State::LiteralSeen) {
        if (cursor[1] != u'%') return createLiteralFormatPiece();
        cursor += 2;
        return nullptr;
    }
    ++cursor;
    if (*cursor == 0) return recordError(code::InvalidFormat);
    if (*cursor != u'%') return FinParseConversionPart();
    ++cursor;
    return parseDoublePercent();
}

// Behind a "%%" that begins a piece, a "%" is looked for one character too far: "%%a%d" is one
// literal, "%%%%" no piece at all. Formats depend on it; it is kept on purpose.
finFormatParser::Piece finFormatParser::parseDoublePercent() {
    if (*cursor == 0 || cursor[1] != u'%') return createLiteralFormatPiece();
    cursor += 2;
    return nullptr;
}

finFormatParser::Piece finFormatParser::FinParseConversionPart() {
    const std::optional<Field> field = CheckForAsteriskAndFieldWidth();
    if (!field) return nullptr;
    if (*cursor == u'[') return parseScansetConversion(*field);
    return parseFormat(parseSubFormat(), *field);
}

std::optional<finFormatParser::Field> finFormatParser::CheckForAsteriskAndFieldWidth() {
    Field field;
    if (*cursor == u'*') field.asterisk = cursor++;
    const char16_t* const digits = cursor;
    if (*cursor == u'-' || detail::isDecimalDigit(*cursor)) {
        char16_t* end = nullptr;
        const int number = scanUTF16Decimal(digits, &end);
        if (end != digits) field.width = number;
        cursor = end;
    }
    if (*cursor == 0 || (cursor != digits && field.width < 1)) {
        recordError(code::InvalidFormat);
        return std::nullopt;
    }
    return field;
}

finFormatParser::Piece finFormatParser::parseScansetConversion(const Field& field) {
    std::size_t open = static_cast<std::size_t>(cursor - pieceStart);
    if (field.asterisk) --open;
    cursor = findSetEnd(cursor + 1);
    if (*cursor == 0) return recordError(code::InvalidFormat);
    ++cursor;
    std::u16string joined;
    return &pieces.emplace<finFormatPieceCMATCH>(
        finFormatPieceInitBlock{takePieceText(field, joined), field.width,
                                field.asterisk != nullptr},
        open);
}

SUB_FORMAT finFormatParser::parseSubFormat() {
    switch (*cursor) {
        case u'h':
            ++cursor;
            return SUB_FORMAT::Short;
        case u'l':
            ++cursor;
            return SUB_FORMAT::Long;
        default:
            return SUB_FORMAT::None;
    }
}

finFormatParser::Piece finFormatParser::parseFormat(SUB_FORMAT sub, const Field& field) {
    const detail::ScanConversion* conversion = detail::findScanConversion(*cursor);
    if (!conversion || !conversion->create[static_cast<int>(sub)])
        return recordError(code::InvalidFormat);
    ++cursor;
    return createNewFormatPiece(*conversion, sub, field);
}

finFormatParser::Piece finFormatParser::createNewFormatPiece(
    const detail::ScanConversion& conversion, SUB_FORMAT sub, const Field& field) {
    std::u16string joined;
    return conversion.create[static_cast<int>(sub)](
        pieces, {takePieceText(field, joined), field.width, field.asterisk != nullptr});
}

finFormatParser::Piece finFormatParser::createLiteralFormatPiece() {
    std::u16string joined;
    return &pieces.emplace<finFormatPieceLiteral>(
        finFormatPieceInitBlock{takePieceText({}, joined), 0, false}, input);
}

finFormatParser::Piece finFormatParser::parseEndOfFormat(State state) {
    switch (state) {
        case State::NothingSeen:
            return recordError(code::InvalidFormat);
        case State::LiteralSeen:
            return createLiteralFormatPiece();
    }
    return recordError(code::InternalError);
}

finFormatParser::Piece finFormatParser::recordError(int code) {
    error = code;
    return nullptr;
}

// The text up to the cursor, where the next piece begins; in `joined` when an asterisk is left out.
std::u16string_view finFormatParser::takePieceText(const Field& field, std::u16string& joined) {
    const char16_t* const start = std::exchange(pieceStart, cursor);
    if (!field.asterisk) return {start, cursor};
    joined.assign(start, field.asterisk);
    joined.append(field.asterisk + 1, cursor);
    return joined;
}

}  // namespace Orvandeil::FileIO
