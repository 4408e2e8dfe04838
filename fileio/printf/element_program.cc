#include "fileio/printf/element_program.h"

#include "fileio/buffers/element_conversion.h"
#include "fileio/printf/fout_format_pieces.h"
#include "fileio/printf/number_field.h"
#include "fileio/printf/whole_run.h"
#include "fileio/text/tcodn_stream.h"

#include <algorithm>
#include <cmath>
#include <cstring>
#include <limits>
#include <utility>

namespace Orvandeil::FileIO::detail {
namespace {

// What one write takes at most; a string's first block holds as much.
constexpr std::size_t largestPiece = constants::firstOutputBlockBytes / sizeof(char16_t);
constexpr std::size_t largestLiteral = 300;

template <class Whole, class Element>
bool isWhole(Element value) {
    if constexpr (std::is_floating_point_v<Element>) {
        constexpr Element lowest = std::numeric_limits<Whole>::min();
        constexpr Element half = static_cast<Element>(std::numeric_limits<Whole>::max() / 2 + 1);
        return value >= lowest && value < 2 * half &&
               static_cast<Element>(static_cast<Whole>(value)) == value;
    } else {
        return std::in_range<Whole>(value);
    }
}

// The class that holds all values of another and that the writers take.
vxClassID widestClass(vxClassID classID) {
    switch (classID) {
        case vxDOUBLE_CLASS:
        case vxSINGLE_CLASS:
            return vxDOUBLE_CLASS;
        case vxUINT64_CLASS:
            return vxUINT64_CLASS;
        default:
            return vxINT64_CLASS;
    }
}

char* writeWhole(char* out, const NumberForm& form, long value) {
    const auto bits = static_cast<std::uint64_t>(value);
    const std::uint64_t magnitude = value < 0 ? 0 - bits : bits;
    if (form.bare && magnitude < tenTo8) return writeBare(out, value < 0, magnitude);
    return writeSigned(out, form, value);
}

char* writeWhole(char* out, const NumberForm& form, unsigned long value) {
    const bool isHex = (form.conversion | 0x20) == 'x';
    if (form.bare && isHex && value >> 32 == 0) {
        return writeBareHex(out, value, form.conversion == 'X');
    }
    return writeUnsigned(out, form, value);
}

// Copies a short text by its whole block, up to sixteen bytes too far.
char* copyAhead(char* out, const std::string& text) {
    if (text.size() < 16) {
        std::memcpy(out, text.data(), 16);
    } else {
        std::memcpy(out, text.data(), text.size());
    }
    return out + text.size();
}

}  // namespace

ElementProgram::ElementProgram(Pieces formatPieces, TcodnStream& out)
    : pieces(formatPieces), stream(out), output(out), usable(compile()) {}

bool ElementProgram::compile() {
    if (!AsciiOutput::suits(stream) || !writesAsPrintf()) return false;
    for (std::size_t i = 0; i < pieces.size(); ++i) {
        const foutFormatPiece& piece = *pieces[i];
        const bool added =
            piece.consumesData() ? addConversion(piece, i) : addLiteral(literalTextOf(piece));
        if (!added) return false;
    }
    if (steps.empty()) return false;
    steps.back().behind += front;
    for (Step& step : steps) {
        step.behind.reserve(16);
        step.mostBytes += step.behind.size();
        if (step.mostBytes > block.size()) return false;
    }
    return true;
}

bool ElementProgram::addLiteral(std::u16string_view text) {
    const auto isAscii = [](char16_t unit) { return unit < 0x80; };
    if (!output.keepsAscii() || text.size() > largestLiteral || !std::ranges::all_of(text, isAscii))
        return false;
    std::string& target = steps.empty() ? front : steps.back().behind;
    for (const char16_t unit : text)
        target += static_cast<char>(unit);
    return target.size() <= largestLiteral;
}

bool ElementProgram::addConversion(const foutFormatPiece& piece, std::size_t index) {
    const PrintfFormat conversion = piece.getConversion();
    const PrintfSubformat modifier = piece.getSubformat();
    const bool hasBits = modifier == SubB || modifier == SubT;
    const auto isFixed = [](WidthPrecisionFieldType kind) {
        return kind == FieldLiteral || kind == FieldAbsent;
    };
    if (conversion == ConvS || hasBits || !isFixed(piece.getWidthKind()) ||
        !isFixed(piece.getPrecisionKind())) {
        return false;
    }
    const char letter = piece.getPrintfText().back();
    const bool hasPrecision = piece.getPrecisionKind() == FieldLiteral;
    const auto form = [&](char ofLetter) {
        return makeNumberForm(ofLetter, piece.getFlags(), piece.getWidthValue(), hasPrecision,
                              piece.getPrecisionValue());
    };
    const bool isSigned = conversion == ConvD || conversion == ConvI;
    const Kind kind = isSigned              ? Signed
                      : conversion == ConvC ? Character
                      : conversion >= ConvE ? Real
                                            : Unsigned;
    // The padding of a character is written for itself, and a converter holds half a pair back.
    if (kind == Character && (!output.keepsUnits() || piece.getWidthValue() > 1)) return false;
    Step step = {kind, form(letter), form('e'), {}, 0, index};
    if (!isKnownForm(step.form) || !isKnownForm(step.exponent)) return false;
    step.mostBytes = std::max(step.form.mostBytes, step.exponent.mostBytes);
    if (step.mostBytes > largestPiece) return false;
    steps.push_back(std::move(step));
    return true;
}

// Null for what only the piece can print.
template <class Element>
char* ElementProgram::writeElement(char* out, const Step& step, Element value) {
    switch (step.kind) {
        case Signed:
            if (isWhole<long>(value)) return writeWhole(out, step.form, static_cast<long>(value));
            break;
        case Unsigned:
            if (isWhole<unsigned long>(value)) {
                return writeWhole(out, step.form, static_cast<unsigned long>(value));
            }
            break;
        case Character:
            if (isWhole<std::uint16_t>(value)) {
                const auto unit = static_cast<std::uint16_t>(value);
                if (unit >= 0x80) return nullptr;
                *out = static_cast<char>(unit);
                return out + 1;
            }
            break;
        case Real:
            break;
    }
    const NumberForm& form = step.kind == Real ? step.form : step.exponent;
    const auto number = static_cast<double>(value);
    return std::isfinite(number) ? writeReal(out, form, number)
                                 : writeNonFinite(out, step.exponent, number);
}

void ElementProgram::run(printfArgumentSource& source, foutFormatPiece*& current) {
    elements = source.plainElements();
    if (elements.count <= steps.size()) return;
    const std::size_t passes = (elements.count - 1) / steps.size();
    const vxClassID asClass = widestClass(elements.classID);
    failedPiece = 0;
    stepped = 0;
    try {
        switch (asClass) {
            case vxDOUBLE_CLASS:
                runAs<double>(source, asClass, passes * steps.size());
                break;
            case vxUINT64_CLASS:
                runAs<unsigned long>(source, asClass, passes * steps.size());
                break;
            default:
                runAs<long>(source, asClass, passes * steps.size());
        }
    } catch (...) {
        current = pieces[failedPiece];
        throw;
    }
}

std::size_t ElementProgram::room(const char* out) const {
    return static_cast<std::size_t>(block.data() + block.size() - out);
}

template <class Element>
void ElementProgram::runAs(printfArgumentSource& source, vxClassID asClass, std::size_t count) {
    const std::size_t elementBytes = fiPkGetSizeFromClassID(elements.classID);
    Element slice[constants::elementSlice];
    const Step* const begin = steps.data();
    const Step* const end = begin + steps.size();
    const Step* step = begin;
    const bool isRun = steps.size() == 1 && isRunForm(step->form, step->behind);
    const std::size_t runBytes = mostRunBytes(step->behind);
    char* out = std::copy(front.begin(), front.end(), block.data());
    blockBegin = {0, 0};
    for (std::size_t done = 0; done < count;) {
        const std::size_t wanted = std::min(count - done, std::size(slice));
        AssignToVoidBuffer(asClass, slice, elements.classID, elements.first + done * elementBytes,
                           wanted);
        for (std::size_t i = 0; i < wanted; ++i) {
            const Place here = {step->pieceIndex, done + i};
            if (isRun && i % wholeRun == 0 && wanted - i >= wholeRun) {
                if (room(out) < runBytes) out = flush(out, here);
                if (char* const written = writeRun(out, step->form, step->behind, slice + i)) {
                    out = written;
                    i += wholeRun - 1;
                    continue;
                }
            }
            if (room(out) < step->mostBytes) out = flush(out, here);
            if (char* const written = writeElement(out, *step, slice[i])) {
                out = written;
            } else {
                out = flush(out, here);
                printByPiece(*step, source, done + i);
            }
            out = copyAhead(out, step->behind);
            if (++step == end) step = begin;
        }
        done += wanted;
    }
    // No further pass begins here.
    flush(out - front.size(), {0, count});
    source.skipElements(count - stepped);
}

void ElementProgram::printByPiece(const Step& step, printfArgumentSource& source,
                                  std::size_t element) {
    source.skipElements(element - stepped);
    failedPiece = step.pieceIndex;
    pieces[step.pieceIndex]->printFormattedOutputToDestination(&stream, &source);
    stepped = element + 1;
    blockBegin = {(step.pieceIndex + 1) % pieces.size(), stepped};
}

// Everything collected goes out before anything else can happen. Returns where to go on.
char* ElementProgram::flush(const char* end, Place next) {
    const auto count = static_cast<std::size_t>(end - block.data());
    std::size_t written = 0;
    try {
        written = output.write(block.data(), count);
    } catch (...) {
        settlePart(output.room());
        throw;
    }
    if (written < count) {
        settlePart(written);
        throw stream.getErrorCode();
    }
    blockBegin = next;
    return block.data();
}

// Leaves what writing piece by piece would have left, of which the last that fits is known.
void ElementProgram::settlePart(std::size_t written) {
    std::size_t settled = 0;
    Place place = blockBegin;
    for (;;) {
        const std::size_t length = bytesOfPiece(place);
        if (settled + length > written) break;
        settled += length;
        if (pieces[place.piece]->consumesData()) ++place.element;
        place.piece = (place.piece + 1) % pieces.size();
    }
    failedPiece = place.piece;
    output.settle(block.data(), settled);
}

std::size_t ElementProgram::bytesOfPiece(Place place) const {
    const foutFormatPiece& piece = *pieces[place.piece];
    if (!piece.consumesData()) return literalTextOf(piece).size();
    const Step& step = *std::ranges::find(steps, place.piece, &Step::pieceIndex);
    const std::size_t elementBytes = fiPkGetSizeFromClassID(elements.classID);
    const void* const element = elements.first + place.element * elementBytes;
    const auto lengthAs = [&]<class Element>(Element value) {
        char text[constants::elementBlockBytes];
        AssignToVoidBuffer(widestClass(elements.classID), &value, elements.classID, element, 1);
        return static_cast<std::size_t>(writeElement(text, step, value) - text);
    };
    switch (widestClass(elements.classID)) {
        case vxDOUBLE_CLASS:
            return lengthAs(0.0);
        case vxUINT64_CLASS:
            return lengthAs(0UL);
        default:
            return lengthAs(0L);
    }
}

}  // namespace Orvandeil::FileIO::detail
