#include "fileio/printf/fout_format_piece.h"

#include "fileio/constants.h"
#include "fileio/errors/code_list.h"
#include "fileio/printf/conversion_token.h"
#include "fileio/printf/long_precision.h"
#include "fileio/printf/number_text.h"
#include "fileio/printf/printf_argument_source.h"
#include "fileio/text/ascii_output.h"
#include "fileio/text/known_streams.h"
#include "fileio/text/tcodn_stream.h"

#include <algorithm>
#include <cmath>
#include <cstring>
#include <limits>

namespace Orvandeil::FileIO {
namespace {

static_assert(code::BadWidthNaN == -15 && code::BadWidthEmptyArg == -19 &&
              code::BadPrecisionNaN == -20 && code::BadPrecisionEmptyArg == -24);

// The digits before the point: 309 for the largest double, 22 for 64 bits in octal; one for a sign.
template <class T>
constexpr unsigned long integerDigits = std::is_floating_point_v<T> ? 310 : 23;

// The text for the C library: without argument numbers, and in the one size of whole numbers.
std::string printfTextOf(const foutFormatPieceInitBlock& init) {
    const detail::ConversionToken token = detail::tokenizeConversion(init.written, 0);
    std::string text = "%";
    const auto append = [&text](std::u16string_view part) {
        for (const char16_t unit : part)
            text += static_cast<char>(unit);
    };
    if (init.forceSign && token.flags.find(u'+') == token.flags.npos) text += '+';
    append(token.flags);
    // A written width may have digits that the value cannot hold: printf refuses it itself.
    if (init.widthKind != FieldAbsent) append(init.widthKind == FieldLiteral ? token.width : u"*");
    if (init.precisionKind == FieldLiteral) {
        // ".-" and ".-0" say precision 0, in a form that printf does not know.
        append(token.precision.find(u'-') == token.precision.npos ? token.precision : u".");
    } else if (init.precisionKind != FieldAbsent) {
        append(u".*");
    }
    if (init.conversion <= ConvX) append(u"ll");
    append(token.conversion);
    return text;
}

std::string exponentForm(const std::string& text) {
    return text.substr(0, text.find_last_not_of("hlbtdiouxXeEfgGsc") + 1) + 'e';
}

std::string withoutArgumentPrecision(const std::string& text) {
    std::string shorter = text;
    return shorter.erase(text.rfind(".*"), std::strlen(".*"));
}

bool fitsInt(long number) {
    return number <= std::numeric_limits<int>::max();
}

// What printf makes of a width that no int can pass: nothing, and a failure of its own.
int printTooWide(TcodnStream* out, long width) {
    return out->printf(('%' + std::to_string(width) + 'd').c_str(), 0);
}

void checkPrinted(TcodnStream* out, int result) {
    if (result < 0) throw out->getErrorCode();
}

}  // namespace

const FieldValidatorT<15, 17, 16, 18, 19> foutFormatPiece::widthValidator;
const FieldValidatorT<20, 22, 21, 23, 24> foutFormatPiece::precisionValidator;

foutFormatPiece::foutFormatPiece(const foutFormatPieceInitBlock& init)
    : numberedIndex(init.numberedIndex),
      flags(init.flags),
      forceSign(init.forceSign),
      width(widthValidator, init.widthKind, init.width),
      precision(precisionValidator, init.precisionKind, init.precision),
      formatPosition(init.formatPosition),
      conversion(init.conversion),
      subformat(init.subformat) {
    if (conversion == NoConversion) return;
    parsedText = printfTextOf(init);
    variants[AsParsed] = &parsedText;
}

foutFormatPiece::~foutFormatPiece() {
    for (int built = AsParsed + 1; built < variantCount; ++built)
        delete variants[built];
}

unsigned long foutFormatPiece::getBufferSize() const {
    return static_cast<unsigned long>(precision.getEffective() + width.getEffective() + 20);
}

void foutFormatPiece::setupFields(printfArgumentSource* source) {
    width.setup(source);
    precision.setup(source);
    if (precision.isNegative()) useVariant(NoPrecision, withoutArgumentPrecision);
}

// Builds the variant from the one in use, once, and switches to it.
void foutFormatPiece::useVariant(Variant wanted, std::string (*build)(const std::string&)) {
    if (variants[wanted] == nullptr) {
        variants[wanted] = new std::string(build(*variants[variant]));
    }
    variant = wanted;
}

void foutFormatPiece::print(TcodnStream* out, printfArgumentSource* source) {
    if (numberedIndex != 0) source->setCurrentArgument(numberedIndex);
    switch (decidePrintMode(source)) {
        case NotPrintable:
        case EmptyArgument:
            return printAsE(out, source);
        case NonFinite:
            return printNonFinite(out, source);
        case Printable:
            return printByType(out, source);
    }
}

template <class T>
void foutFormatPiece::printAs(TcodnStream* out, printfArgumentSource* source) {
    if (!source->prepareCurrentArgument(true)) return printWidthBuffer(out, 0);
    const T value = source->getCurrentArgumentAs<T>();
    if (out->needsBufferSize()) out->setBufferSize(getBufferSize() + integerDigits<T>);
    checkPrinted(out, printValue(out, value));
}

template void foutFormatPiece::printAs<double>(TcodnStream*, printfArgumentSource*);
template void foutFormatPiece::printAs<long>(TcodnStream*, printfArgumentSource*);
template void foutFormatPiece::printAs<unsigned long>(TcodnStream*, printfArgumentSource*);

// A negative width argument is passed as its magnitude: it justifies numbers to the right, while
// text goes to the left. That difference is kept on purpose.
template <class T>
int foutFormatPiece::printValue(TcodnStream* out, T value) const {
#ifdef FILEIO_FAST_PATHS
    int result = 0;
    if (printDirectly(out, value, result)) return result;
#endif
    if constexpr (std::is_floating_point_v<T>) {
        if (isLongPrecision(*out, value)) {
            return detail::printLongPrecision(*out, *variants[variant],
                                              static_cast<int>(width.getEffective()),
                                              static_cast<int>(precision.getEffective()), value);
        }
    }
    const char* const text = variants[variant]->c_str();
    const bool passPrecision = precision.isFromArgument() && !precision.isNegative();
    const int precisionPassed = static_cast<int>(precision.getEffective());
    if (!width.isFromArgument()) {
        return passPrecision ? out->printf(text, precisionPassed, value) : out->printf(text, value);
    }
    if (!fitsInt(width.getEffective())) return printTooWide(out, width.getEffective());
    const int widthPassed = static_cast<int>(width.getEffective());
    return passPrecision ? out->printf(text, widthPassed, precisionPassed, value)
                         : out->printf(text, widthPassed, value);
}

// What no int can pass is refused by printf, and a stream that the library does not know sees one
// print for a number.
bool foutFormatPiece::isLongPrecision(const TcodnStream& out, double value) const {
    constexpr long largest = std::numeric_limits<int>::max();
    const long digits = hasPrecision() ? precision.getEffective() : 0;
    const bool mayBeRefused = (digits == largest && (variants[variant]->back() | 0x20) == 'g') ||
                              width.getEffective() >= largest;
    return digits >= detail::longPrecision && !mayBeRefused && std::isfinite(value) &&
           detail::isKnownStream(out);
}

#ifdef FILEIO_FAST_PATHS
template <class T>
bool foutFormatPiece::printDirectly(TcodnStream* out, T value, int& result) const {
    if constexpr (std::is_floating_point_v<T>) {
        // An object may become such a number.
        if (!std::isfinite(value)) return false;
    }
    const long field = width.getEffective();
    const long digits = hasPrecision() ? precision.getEffective() : 0;
    auto* const console = detail::exactly<outputScreenStream>(*out);
    const bool suits = console != nullptr || detail::AsciiOutput::suits(*out);
    if (std::max(field, digits) > detail::largestField || !suits) return false;
    const bool inExponentForm = variant == Exponent || variant == ExponentNoPrecision;
    const char letter = inExponentForm ? 'e' : variants[AsParsed]->back();
    const detail::NumberForm form = detail::makeNumberForm(
        letter, flags, static_cast<int>(field), hasPrecision(), static_cast<int>(digits));
    if (!detail::isKnownForm(form) || !detail::writesAsPrintf()) return false;
    char text[detail::largestNumberBytes + 1];
    char* const end = detail::writeNumber(text, form, value);
    *end = '\0';
    const auto count = static_cast<std::size_t>(end - text);
    if (console != nullptr) {
        result = console->putFormatted(text, count);
    } else {
        const std::size_t written = detail::AsciiOutput(*out).write(text, count);
        result = written == count ? static_cast<int>(count) : -1;
    }
    return true;
}
#endif

void foutFormatPiece::printAsE(TcodnStream* out, printfArgumentSource* source) {
    useVariant(variant == NoPrecision ? ExponentNoPrecision : Exponent, exponentForm);
    printAs<double>(out, source);
}

void foutFormatPiece::printNonFinite(TcodnStream* out, printfArgumentSource* source) {
    const char* const text = nonFiniteText(source->getCurrentArgumentAs<double>());
    const long field = std::max(width.getEffective(), static_cast<long>(std::strlen(text)));
    if (out->needsBufferSize()) {
        out->setBufferSize(static_cast<unsigned long>(std::max(width.getEffective(), 4L)));
    }
    printField(out, "%*s", isLeftJustified() ? -field : field, text);
}

// A negative width asks for the sign as well as for the left side; kept on purpose.
const char* foutFormatPiece::nonFiniteText(double value) const {
    if (std::isnan(value)) return forceSign ? "+NaN" : "NaN";
    if (value < 0) return "-Inf";
    if (hasFlag(ShowSign) || width.isNegative()) return "+Inf";
    return hasFlag(SpaceSign) ? " Inf" : "Inf";
}

void foutFormatPiece::printField(TcodnStream* out, const char* form, long field,
                                 const char* text) const {
    if (!fitsInt(std::abs(field))) return checkPrinted(out, printTooWide(out, std::abs(field)));
    checkPrinted(out, out->printf(form, static_cast<int>(field), text));
}

void foutFormatPiece::printWidthBuffer(TcodnStream* out, unsigned long printed) const {
    const unsigned long wanted = static_cast<unsigned long>(width.getEffective());
    if (printed >= wanted) return;
    char16_t pads[constants::paddingBlockUnits];
    std::fill(std::begin(pads), std::end(pads), hasFlag(ZeroPad) ? u'0' : u' ');
    // A stream that the library does not know sees every pad as a write of its own.
    const unsigned long block = detail::isKnownStream(*out) ? std::size(pads) : 1;
    for (unsigned long done = printed; done < wanted;) {
        const unsigned long count = std::min(block, wanted - done);
        if (out->PutString(pads, count) < count) throw out->getErrorCode();
        done += count;
    }
}

void foutFormatPiece::printPadded(TcodnStream* out, std::u16string_view content) const {
    if (!isLeftJustified()) printWidthBuffer(out, content.size());
    if (!content.empty() && out->PutString(content) < content.size()) throw out->getErrorCode();
    if (isLeftJustified()) printWidthBuffer(out, content.size());
}

}  // namespace Orvandeil::FileIO
