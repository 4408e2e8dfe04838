#pragma once

#include "fileio/export.h"
#include "fileio/memory_operation_overloads.h"
#include "fileio/piece_list.h"
#include "fileio/printf/format_field.h"
#include "fileio/printf/printability.h"
#include "fileio/printf/vocabulary.h"

#include <string>
#include <string_view>

namespace Orvandeil::FileIO {

class TcodnStream;
class foutFormatPiece;
class printfArgumentSource;

using foutFormatPieceList = detail::PieceList<foutFormatPiece, 1536>;

// What the parser found out about one piece.
struct foutFormatPieceInitBlock {
    unsigned long numberedIndex = 0;
    PrintFormatFlags flags = NoFlags;
    int width = 0;
    WidthPrecisionFieldType widthKind = FieldAbsent;
    int precision = 0;
    WidthPrecisionFieldType precisionKind = FieldAbsent;
    PrintfSubformat subformat = NoSubformat;
    PrintfFormat conversion = NoConversion;
    bool forceSign = false;
    // A literal, or a conversion from its "%" to its letter; outlives the piece.
    std::u16string_view written = {};
    unsigned long formatPosition = 0;
};

// One piece of an output format. Printing takes width and precision from the arguments where the
// format says "*", decides how the current value can be shown, takes the value and writes it. All
// failures are thrown as int: a code of the argument source or of a field, "NoMemory", or the
// stream's code after a failed or short write.
class FILEIO_API foutFormatPiece : public fiMemoryOperationOverloads {
public:
    explicit foutFormatPiece(const foutFormatPieceInitBlock& init);
    foutFormatPiece(const foutFormatPiece&) = delete;
    foutFormatPiece& operator=(const foutFormatPiece&) = delete;
    virtual ~foutFormatPiece();

    // Adds a new piece to the list.
    static void createFoutFormatPiece(foutFormatPieceList& pieces,
                                      const foutFormatPieceInitBlock& init);

    virtual bool consumesData() const { return true; }
    virtual bool isUnsigned() const { return false; }
    // Writes the current value in the conversion's own form.
    virtual void printByType(TcodnStream* out, printfArgumentSource* source) = 0;
    // The characters needed beside the digits of the value.
    virtual unsigned long getBufferSize() const;
    // How the current argument can be shown.
    virtual Printability decidePrintMode(printfArgumentSource* source) const = 0;

    void printFormattedOutputToDestination(TcodnStream* out, printfArgumentSource* source) {
        setup(source);
        print(out, source);
    }
    void setup(printfArgumentSource* source) {
        variant = AsParsed;
        if (width.isFromArgument() || precision.isFromArgument()) setupFields(source);
    }
    void print(TcodnStream* out, printfArgumentSource* source);

    PrintfFormat getConversion() const { return conversion; }
    PrintfSubformat getSubformat() const { return subformat; }
    PrintFormatFlags getFlags() const { return flags; }
    unsigned long getNumberedIndex() const { return numberedIndex; }
    WidthPrecisionFieldType getWidthKind() const { return width.getKind(); }
    int getWidthValue() const { return width.getValue(); }
    WidthPrecisionFieldType getPrecisionKind() const { return precision.getKind(); }
    int getPrecisionValue() const { return precision.getValue(); }
    // For the C library; empty for a literal.
    const std::string& getPrintfText() const { return parsedText; }
    // Where the piece stands in the format; for a literal in front of a "%", the place of the "%".
    unsigned long getFormatPosition() const { return formatPosition; }

protected:
    // Writes the value as T through the C library's printf; only padding for an empty argument.
    template <class T>
    void printAs(TcodnStream* out, printfArgumentSource* source);
    void printAsE(TcodnStream* out, printfArgumentSource* source);
    void printNonFinite(TcodnStream* out, printfArgumentSource* source);
    // Pads from `printed` characters to the width.
    void printWidthBuffer(TcodnStream* out, unsigned long printed) const;
    // Pads `content` on the side that the justification asks for.
    void printPadded(TcodnStream* out, std::u16string_view content) const;
    // Writes a text by a printf form that takes a width before it.
    void printField(TcodnStream* out, const char* form, long field, const char* text) const;

    bool hasFlag(PrintFormatFlags flag) const { return (flags & flag) != 0; }
    bool isLeftJustified() const { return hasFlag(LeftJustify) || width.isNegative(); }
    // A negative precision from an argument counts as none.
    bool hasPrecision() const { return precision.isPresent() && !precision.isNegative(); }

private:
    friend struct LayoutProbe;

    // The printf texts of a piece: as parsed, in exponent form, and both without the ".*" of a
    // negative precision. All but the first are built when they are first needed.
    enum Variant : int { AsParsed = 0, Exponent = 1, NoPrecision = 2, ExponentNoPrecision = 3 };
    static constexpr int variantCount = 4;

    void setupFields(printfArgumentSource* source);
    const char* nonFiniteText(double value) const;
    void useVariant(Variant wanted, std::string (*build)(const std::string&));
    template <class T>
    int printValue(TcodnStream* out, T value) const;
    bool isLongPrecision(const TcodnStream& out, double value) const;
    // What printValue does, without the C library. False when it cannot, and nothing is done.
    template <class T>
    bool printDirectly(TcodnStream* out, T value, int& result) const;

    static const FieldValidatorT<15, 17, 16, 18, 19> widthValidator;
    static const FieldValidatorT<20, 22, 21, 23, 24> precisionValidator;

    // Owned, but for the first, which stands in the piece itself.
    const std::string* variants[variantCount] = {};
    Variant variant = AsParsed;
    unsigned long numberedIndex;
    PrintFormatFlags flags;
    bool forceSign;

protected:
    FormatField width;
    FormatField precision;

private:
    unsigned long formatPosition;
    PrintfFormat conversion;
    PrintfSubformat subformat;
    std::string parsedText;
};

}  // namespace Orvandeil::FileIO
