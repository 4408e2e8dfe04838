#include "fileio/scanf/scan_program.h"

#ifdef FILEIO_FAST_PATHS

#include "fileio/host/text.h"
#include "fileio/scanf/fin_format_pieces.h"
#include "fileio/scanf/reading_functors.h"
#include "fileio/streams/decimal_field.h"
#include "fileio/streams/file_stream.h"
#include "fileio/text/blanks.h"
#include "fileio/text/input_string_stream.h"
#include "fileio/text/units_ahead.h"

#include <algorithm>
#include <array>
#include <bit>
#include <cstring>
#include <limits>
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

// What was taken of a stream, as it shows in what can be given back.
struct Taken {
    const char* endOfNumbers;
    const char* end;
    bool isLookedBehind = false;  // at the byte behind, which was given back

    void number(const char* next) {
        endOfNumbers = end = next;
        isLookedBehind = false;
    }
    void text(const char* next, bool lookedBehind) {
        end = next;
        isLookedBehind = lookedBehind;
    }
    template <class Stream>
    void takeFrom(Stream& stream, const char* begin) const {
        if (endOfNumbers != begin) stream.takeScanned(endOfNumbers);
        UnitsAhead(stream).take(endOfNumbers, end, isLookedBehind ? 1 : 0);
    }
};

}  // namespace

ScanProgram::ScanProgram(finFormatParser& parser, TcodnStream& from)
    : input(&from),
      storesUnits(parser.getResultClass() == vxCHAR_CLASS),
      storesDoubles(parser.getResultClass() == vxDOUBLE_CLASS) {
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
        const bool isAdded = piece.isLiteral()                    ? addLiteral(piece.getText())
                             : piece.getClassID() == vxCHAR_CLASS ? addText(piece)
                                                                  : addNumber(piece);
        if (!isAdded) return false;
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

bool ScanProgram::addText(const finFormatPiece& piece) {
    Step step = {.kind = Step::Word, .isStored = !piece.isSuppressed(), .set = sets.size()};
    const auto anyCharacter = [](char16_t) { return true; };
    const auto isOfWord = [blanks = Blanks()](char16_t unit) { return !blanks.has(unit); };
    switch (piece.getFormat()) {
        case FORMAT::String:
            sets.emplace_back(isOfWord);
            break;
        case FORMAT::Char:
            step.kind = Step::Characters;
            sets.emplace_back(anyCharacter);
            break;
        case FORMAT::Scanset:
            step.kind = Step::Set;
            sets.emplace_back([&set = static_cast<const finFormatPieceCMATCH&>(piece)](
                                  char16_t unit) { return set.accepts(unit); });
            break;
        default:
            return false;
    }
    const int none = step.kind == Step::Characters ? 1 : std::numeric_limits<int>::max();
    step.width = static_cast<std::size_t>(piece.getWidth() < 0 ? none : piece.getWidth());
    hasText = true;
    steps.push_back(step);
    return step.width != 0;
}

ScanProgram::Run ScanProgram::run(std::size_t nextPiece, std::size_t wanted, Room room) const {
    const bool canDecode = !hasText || input->readsAsciiAsIs();
    if (source == Source::None || !canDecode) return {.nextPiece = nextPiece};
    if (source == Source::File)
        return runOn(static_cast<fileStream&>(*input), nextPiece, wanted, room);
    return runOn(static_cast<inputStringStream&>(*input), nextPiece, wanted, room);
}

template <class Stream>
ScanProgram::Run ScanProgram::runOn(Stream& stream, std::size_t nextPiece, std::size_t wanted,
                                    Room room) const {
    using Numbers = NumbersOf<Stream>;
    const std::string_view unread = stream.bytesToScan();
    FieldBytes bytes = {unread.data(), unread.data() + unread.size(), Numbers::isAll};
    Taken taken = {bytes.next, bytes.next};
    Run done = {.nextPiece = nextPiece};
    const std::size_t roomBefore = room.elements;
    std::size_t rounds = 0, roundsDone = 0;
    const Step* step = stepOfPiece(nextPiece);
    for (; done.values < wanted; ++step) {
        if (step == steps.data() + steps.size()) {
            step = steps.data();
            ++rounds;
        }
        if (step->isLiteral()) {
            if (!takeLiteral(*step, bytes)) break;
            continue;
        }
        if (step->isText()) {
            const std::size_t length = takeText(*step, bytes, room);
            if (length == 0) break;
            taken.text(bytes.next, length < step->width);
        } else {
            if (!takeNumber<Numbers>(*step, bytes, room)) break;
            taken.number(bytes.next);
        }
        if (step->isStored) ++done.values;
        roundsDone = rounds;
        done.nextPiece = step->endOfPiece;
    }
    taken.takeFrom(stream, unread.data());
    done.elements = roomBefore - room.elements;
    done.pieces = roundsDone * firstSteps.size() + done.nextPiece - nextPiece;
    done.recycled = roundsDone != 0;
    return done;
}

const ScanProgram::Step* ScanProgram::stepOfPiece(std::size_t piece) const {
    return steps.data() + (piece == firstSteps.size() ? steps.size() : firstSteps[piece]);
}

inline bool ScanProgram::takeLiteral(const Step& step, FieldBytes& bytes) const {
    if (step.kind == Step::Blanks) {
        bytes.skip(isCBlank);
        return true;
    }
    if (!bytes.startsWith(step.character)) return false;
    ++bytes.next;
    return true;
}

template <class Numbers>
bool ScanProgram::takeNumber(const Step& step, FieldBytes& bytes, Room& room) const {
    std::uint64_t bits = 0;
    if (room.elements == 0) return false;
    bytes.skip(Numbers::isSkipped);
    if (!parseNumber<Numbers>(step.kind, bytes, bits)) return false;
    std::memcpy(room.next, &bits, sizeof bits);
    room.next += step.isStored ? sizeof bits : 0;
    room.elements -= step.isStored ? 1 : 0;
    return true;
}

// The bytes taken behind blanks; 0 when that is left to the piece.
std::size_t ScanProgram::takeText(const Step& step, FieldBytes& bytes, Room& room) const {
    const AsciiSet& set = sets[step.set];
    if (step.kind == Step::Word)
        bytes.skip([&set](char byte) { return AsciiSet::isMember(byte) && !set.has(byte); });
    const auto ahead = static_cast<std::size_t>(bytes.end - bytes.next);
    std::size_t most = std::min(ahead, step.width);
    if (step.isStored) most = std::min(most, room.elements);
    const std::size_t length = set.lengthOf(bytes.next, most);
    if (length < step.width) {
        const bool isEnded = length < most && AsciiSet::isMember(bytes.next[length]);
        if (!isEnded || step.kind == Step::Characters) return 0;
    }
    if (step.isStored) storeText(bytes.next, length, ahead, room);
    bytes.next += length;
    return length;
}

void ScanProgram::storeText(const char* text, std::size_t length, std::size_t readable,
                            Room& room) const {
    if (storesUnits) {
        widenAscii(text, length, std::min(readable, room.elements),
                   reinterpret_cast<char16_t*>(room.next));
        room.next += length * sizeof(char16_t);
    } else {
        for (const char character : std::string_view(text, length)) {
            const std::uint64_t bits = stored(int{character});
            std::memcpy(room.next, &bits, sizeof bits);
            room.next += sizeof bits;
        }
    }
    room.elements -= length;
}

template <class Numbers>
bool ScanProgram::parseNumber(Step::Kind kind, FieldBytes& bytes, std::uint64_t& bits) const {
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
