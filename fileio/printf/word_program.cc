#include "fileio/printf/word_program.h"

#include "fileio/buffers/host_array.h"
#include "fileio/printf/fout_format_pieces.h"
#include "fileio/text/ascii_output.h"

#include <cstring>
#include <typeinfo>
#include <utility>

namespace Orvandeil::FileIO::detail {

WordProgram::WordProgram(Pieces formatPieces, TcodnStream& out)
    : pieces(formatPieces), string(nullptr) {
    if (typeid(out) != typeid(outputStringStream) || !AsciiOutput::suits(out)) return;
    if (AsciiOutput(out).keepsUnits() && compile()) string = static_cast<outputStringStream*>(&out);
}

bool WordProgram::compile() {
    std::size_t conversions = 0;
    for (const foutFormatPiece* const piece : pieces) {
        literals.push_back(literalTextOf(*piece));
        literalUnits += literals.back().size();
        if (!piece->consumesData()) continue;
        const bool plain = piece->getConversion() == ConvS &&
                           piece->getWidthKind() == FieldAbsent &&
                           piece->getPrecisionKind() == FieldAbsent;
        if (!plain || ++conversions > 1) return false;
    }
    return conversions == 1;
}

// As the stream would be asked to write it, without asking for its encoding every time.
void WordProgram::put(std::u16string_view text) const {
    if (text.empty()) return;
    string->outputStringStream::PutNElements(text.size(), text.data(), sizeof(char16_t));
}

void WordProgram::copyPass(std::u16string_view word, char16_t* out) const {
    for (const std::u16string_view literal : literals) {
        const std::u16string_view text = literal.empty() ? word : literal;
        if (text.size() == 1) {
            *out = text.front();
        } else if (!text.empty()) {
            std::memcpy(out, text.data(), text.size() * sizeof(char16_t));
        }
        out += text.size();
    }
}

void WordProgram::run(printfArgumentSource& source, foutFormatPiece*& current) const {
    AsciiOutput output(*string);
    const std::span<const vxArray* const> arguments = source.wholeArguments();
    std::size_t done = 0;
    vxClassID nextClass = arguments.empty() ? vxUNKNOWN_CLASS : vxArrayClassID(arguments.front());
    while (done + 1 < arguments.size()) {
        const vxArray* const array = arguments[done];
        const vxClassID classID = std::exchange(nextClass, vxArrayClassID(arguments[done + 1]));
        // The step to an object may raise, which comes before the text in front of it is written.
        if (classID != vxCHAR_CLASS || nextClass == vxOBJECT_CLASS) break;
        const auto* const text = static_cast<const char16_t*>(vxArrayData(array));
        const std::size_t length = elementCount(array);
        if (char16_t* const out = output.takeUnits(length + literalUnits)) {
            copyPass({text, length}, out);
        } else {
            for (std::size_t i = 0; i < pieces.size(); ++i) {
                current = pieces[i];
                put(literals[i].empty() ? std::u16string_view(text, length) : literals[i]);
            }
        }
        ++done;
    }
    if (done != 0) source.skipArguments(done);
}

}  // namespace Orvandeil::FileIO::detail
