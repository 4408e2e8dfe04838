#include "fileio/printf/word_program.h"

#include "fileio/buffers/host_array.h"
#include "fileio/printf/fout_format_pieces.h"
#include "fileio/text/ascii_output.h"

#include <algorithm>
#include <array>
#include <cstring>
#include <typeinfo>
#include <utility>

namespace Orvandeil::FileIO::detail {
namespace {

// Texts whose arrays are asked for together, so that the processor waits for memory once for many.
using Words = std::array<std::u16string_view, 16>;

// The texts of the first arguments, as far as they are char arrays: how many. Not of the last
// argument, nor of one in front of an object: the step to an object may raise, which comes before
// the text in front of it is written.
std::size_t gatherWords(std::span<const vxArray* const> arguments, Words& words) {
    const std::size_t most = std::min(arguments.size() - 1, words.size());
    vxClassID nextClass = vxArrayClassID(arguments.front());
    for (std::size_t i = 0; i < most; ++i) {
        const vxClassID classID = std::exchange(nextClass, vxArrayClassID(arguments[i + 1]));
        if (classID != vxCHAR_CLASS || nextClass == vxOBJECT_CLASS) return i;
        const auto* const text = static_cast<const char16_t*>(vxArrayData(arguments[i]));
        __builtin_prefetch(text);
        words[i] = {text, elementCount(arguments[i])};
    }
    return most;
}

}  // namespace

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

void WordProgram::printPass(std::u16string_view word, AsciiOutput& output,
                            foutFormatPiece*& current) const {
    if (char16_t* const out = output.takeUnits(word.size() + literalUnits)) {
        return copyPass(word, out);
    }
    for (std::size_t i = 0; i < pieces.size(); ++i) {
        current = pieces[i];
        put(literals[i].empty() ? word : literals[i]);
    }
}

void WordProgram::run(printfArgumentSource& source, foutFormatPiece*& current) const {
    AsciiOutput output(*string);
    const std::span<const vxArray* const> arguments = source.wholeArguments();
    std::size_t done = 0;
    while (done + 1 < arguments.size()) {
        Words words;
        const std::size_t count = gatherWords(arguments.subspan(done), words);
        if (count == 0) break;
        for (const std::u16string_view word : std::span(words).first(count))
            printPass(word, output, current);
        done += count;
    }
    if (done != 0) source.skipArguments(done);
}

}  // namespace Orvandeil::FileIO::detail
