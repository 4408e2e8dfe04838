#include "fileio/scanf/scan_program.h"

#ifdef FILEIO_FAST_PATHS

#include "fileio/host/text.h"
#include "fileio/scanf/reading_functors.h"
#include "fileio/streams/decimal_field.h"
#include "fileio/streams/file_stream.h"
#include "fileio/text/input_string_stream.h"

#include <algorithm>
#include <array>
#include <bit>
#include <cstring>
#include <string_view>
#include <type_traits>
#include <typeinfo>

namespace Orvandeil::FileIO::detail {
namespace {

// A host may have other blanks than C.
bool hostKnowsBlanks() {
    constexpr std::u16string_view blanks = u" \t\n\v\f\r";
    return std::ranges::all_of(blanks, qzu_isbreakablespace);
}

// How a file stream reads numbers.
struct NumbersOfFile {
    static constexpr bool isAll = false;
    static bool isSkipped(char byte) { return isCBlank(byte); }
    static bool takeDouble(FieldBytes& bytes, double& value) { return takeReal(bytes, value); }
};

// How a text in memory does. Real numbers have the host's syntax.
struct NumbersOfText {
    static constexpr bool isAll = true;
    static bool isSkipped(char byte) { return isCBlank(byte) || byte == 0; }
    static bool takeDouble(FieldBytes& bytes, double& value) {
        FieldBytes digits = bytes;
        digits.takeMinus();
        const std::string_view start(digits.next, digits.end);
        if (start.starts_with("0x") || start.starts_with("0X")) return false;
        std::size_t consumed = 0;
        value =
            vxTextToDouble(bytes.next, static_cast<std::size_t>(bytes.end - bytes.next), &consumed);
        bytes.next += consumed;
        return consumed != 0;
    }
};

template <class Stream>
struct NumbersOf;
template <>
struct NumbersOf<fileStream> : NumbersOfFile {};
template <>
struct NumbersOf<inputStringStream> : NumbersOfText {};

template <class T>
T limited(const DecimalInteger& number) {
    if constexpr (std::is_signed_v<T>) {
        return saturateSigned<T>(number.asSigned());
    } else {
        const bool negative = number.negative && number.magnitude != 0;
        return limitUnsigned<T>(static_cast<unsigned long>(number.asSigned()), negative);
    }
}

}  // namespace

ScanProgram::ScanProgram(finFormatParser& parser, TcodnStream& from)
    : input(&from), storesDoubles(parser.getResultClass() == vxDOUBLE_CLASS) {
    if (parser.getInput() != input || !hostKnowsBlanks() || !addPieces(parser)) return;
    if (typeid(from) == typeid(fileStream)) source = Source::File;
    if (typeid(from) == typeid(inputStringStream)) source = Source::Text;
}

// False when there is a piece that is not for a program.
bool ScanProgram::addPieces(finFormatParser& parser) {
    for (std::size_t i = 0; i < parser.getPieceCount(); ++i) {
        int status = 0;
        const finFormatPiece& piece = *parser.fiPkGetScanFormatPiece(i, status);
        firstSteps.push_back(steps.size());
        if (piece.isLiteral() ? !addLiteral(piece.getText()) : !addNumber(piece)) return false;
        steps.back().endOfPiece = i + 1;
    }
    return std::ranges::any_of(steps, &Step::isStored);
}

bool ScanProgram::addLiteral(std::u16string_view text) {
    hasText = true;
    for (std::size_t i = 0; i < text.size(); ++i) {
        const char16_t unit = text[i];
        if (unit >= 0x80) return false;
        const bool blank = qzu_isbreakablespace(unit);
        if (blank && !isCBlank(static_cast<char>(unit))) return false;
        steps.push_back(
            {.kind = blank ? Step::Blanks : Step::Character, .character = static_cast<char>(unit)});
        if (unit == u'%') ++i;
    }
    return true;
}

bool ScanProgram::addNumber(const finFormatPiece& piece) {
    using Kinds = std::array<Step::Kind, 3>;
    constexpr Kinds integers = {Step::Int, Step::Short, Step::Long};
    constexpr Kinds naturals = {Step::UnsignedInt, Step::UnsignedShort, Step::UnsignedLong};
    constexpr Kinds reals = {Step::Double, Step::Single, Step::Double};
    const FORMAT format = piece.getFormat();
    const bool isReal = format == FORMAT::Float, isInteger = format == FORMAT::Integer;
    if (piece.getWidth() >= 0 || (!isReal && !isInteger && format != FORMAT::Unsigned))
        return false;
    const char16_t letter = piece.getText().rbegin()[1];
    const auto length = static_cast<std::size_t>(letter == u'h'   ? SUB_FORMAT::Short
                                                 : letter == u'l' ? SUB_FORMAT::Long
                                                                  : SUB_FORMAT::None);
    const Kinds& kinds = isReal ? reals : isInteger ? integers : naturals;
    steps.push_back({.kind = kinds[length], .isStored = !piece.isSuppressed()});
    return true;
}

ScanProgram::Run ScanProgram::run(std::size_t nextPiece, char* out, std::size_t room) const {
    const bool canDecode = !hasText || input->readsAsciiAsIs();
    if (source == Source::None || !canDecode) return {.nextPiece = nextPiece};
    if (source == Source::File)
        return runOn(static_cast<fileStream&>(*input), nextPiece, out, room);
    return runOn(static_cast<inputStringStream&>(*input), nextPiece, out, room);
}

template <class Stream>
ScanProgram::Run ScanProgram::runOn(Stream& stream, std::size_t nextPiece, char* out,
                                    std::size_t room) const {
    using Numbers = NumbersOf<Stream>;
    const std::string_view unread = stream.bytesToScan();
    FieldBytes bytes = {unread.data(), unread.data() + unread.size(), Numbers::isAll};
    const char* taken = bytes.next;
    Run done = {.nextPiece = nextPiece};
    std::size_t rounds = 0, roundsDone = 0;
    const Step* step = stepOfPiece(nextPiece);
    while (done.values < room) {
        if (step == steps.data() + steps.size()) {
            step = steps.data();
            ++rounds;
        }
        if (step->kind == Step::Character) {
            if (!bytes.startsWith(step->character)) break;
            ++bytes.next;
        } else if (step->kind == Step::Blanks) {
            bytes.skip(isCBlank);
        } else {
            bytes.skip(Numbers::isSkipped);
            std::uint64_t bits = 0;
            if (!takeNumber<Numbers>(step->kind, bytes, bits)) break;
            std::memcpy(out + done.values * sizeof bits, &bits, sizeof bits);
            if (step->isStored) ++done.values;
            taken = bytes.next;
            roundsDone = rounds;
            done.nextPiece = step->endOfPiece;
        }
        ++step;
    }
    if (taken != unread.data()) stream.takeScanned(taken);
    done.pieces = roundsDone * firstSteps.size() + done.nextPiece - nextPiece;
    done.recycled = roundsDone != 0;
    return done;
}

const ScanProgram::Step* ScanProgram::stepOfPiece(std::size_t piece) const {
    return steps.data() + (piece == firstSteps.size() ? steps.size() : firstSteps[piece]);
}

template <class Numbers>
bool ScanProgram::takeNumber(Step::Kind kind, FieldBytes& bytes, std::uint64_t& bits) const {
    if (kind == Step::Single || kind == Step::Double) {
        double value = 0;
        if (!Numbers::takeDouble(bytes, value)) return false;
        if (kind == Step::Single) value = static_cast<double>(static_cast<float>(value));
        bits = std::bit_cast<std::uint64_t>(value);
        return true;
    }
    DecimalInteger number;
    if (!takeInteger(bytes, number)) return false;
    bits = bitsOf(kind, number);
    return true;
}

inline std::uint64_t ScanProgram::bitsOf(Step::Kind kind, const DecimalInteger& number) const {
    switch (kind) {
        case Step::Short:
            return stored(limited<short>(number));
        case Step::Int:
            return stored(limited<int>(number));
        case Step::Long:
            return stored(limited<long>(number));
        case Step::UnsignedShort:
            return stored(limited<unsigned short>(number));
        case Step::UnsignedInt:
            return stored(limited<unsigned int>(number));
        default:
            return stored(limited<unsigned long>(number));
    }
}

template <class T>
std::uint64_t ScanProgram::stored(T value) const {
    if (storesDoubles) return std::bit_cast<std::uint64_t>(static_cast<double>(value));
    return static_cast<std::uint64_t>(value);
}

}  // namespace Orvandeil::FileIO::detail

#endif
