#include "tests/properties/properties.h"
#include "tests/text/memory_stream.h"

#include <algorithm>

namespace properties {
namespace {

using namespace Orvandeil::FileIO;

const char* anyConverter(Bytes& input) {
    const auto count = static_cast<std::size_t>(ucnv_countAvailable());
    return ucnv_getAvailableName(static_cast<int>(input.below(count)));
}

// Reads in steps of any size, and never across a boundary.
std::u16string decodedInSteps(Bytes& input, const char* encoding, std::string_view bytes) {
    MemoryStream stream(encoding, bytes);
    stream.boundary = input.below(bytes.size() + 1);
    std::u16string all, part;
    std::size_t consumed = 0, step = 0;
    do {
        step = 1 + (input.below(2) == 0 ? input.below(3) : input.below(40));
        const unsigned long start = stream.position();
        stream.GetNCodePoints(part, step, &consumed);
        if (consumed != stream.position() - start) throw Broken("miscounted bytes");
        const auto units = unitsOf(encoding, bytes.substr(0, stream.position())).size();
        requireEqual(std::to_string(stream.getUTF16Position()), std::to_string(units), encoding);
        all += part;
    } while (part.size() == step);
    requireEqual(std::to_string(stream.position()), std::to_string(bytes.size()), encoding);
    requireEqual(std::to_string(stream.getErrorCode()), "0", encoding);
    return all;
}

// Writes in pieces of any size, one write each.
std::string encodedInPieces(Bytes& input, const char* encoding, std::u16string_view text) {
    MemoryStream stream(encoding);
    int pieces = 0;
    for (; !text.empty(); ++pieces) {
        const std::size_t length = std::min(1 + input.below(20), text.size());
        stream.PutString(text.substr(0, length));
        text.remove_prefix(length);
    }
    requireEqual(std::to_string(stream.getErrorCode()), "0", encoding);
    requireEqual(std::to_string(stream.writes), std::to_string(pieces), encoding);
    return stream.output;
}

// ICU over the whole text. A last unit that waits for its partner stays in the converter, as in the
// stream; UTF-16 goes out as it is.
std::string encodedAtOnce(const char* encoding, std::u16string_view text) {
    if (encoding == std::string_view("UTF-16")) return bytesOf(text);
    UErrorCode status = U_ZERO_ERROR;
    UConverter* const converter = ucnv_open(encoding, &status);
    std::string bytes(text.size() * 12 + 64, '\0');
    char* target = bytes.data();
    const char16_t* source = text.data();
    ucnv_fromUnicode(converter, &target, target + bytes.size(), &source, source + text.size(),
                     nullptr, false, &status);
    ucnv_close(converter);
    bytes.resize(static_cast<std::size_t>(target - bytes.data()));
    return bytes;
}

// Whether a converter of ICU's, fed in pieces, does not give what it gives for the whole.
bool dependsOnPieces(std::string_view encoding, bool isDecoding) {
    return encoding == "SCSU" || encoding == (isDecoding ? "x11-compound-text" : "LMBCS-1");
}

}  // namespace

// Where a text is cut does not matter for what it decodes to.
void decoding(Bytes& input) {
    static const std::vector<std::string> parts = split(
        "\xE3\x81|\xE3\x81\x82|\xF0\x9F\x98\x80|\x1B$B|\x1B(B|\r\n|\xED\xA0\x80|\xFE\xFF|"
        "\xFF\xFE|+AGE-|\x0E\x30\x0F|~{0!~}|\x81|\xC0\x80|\xE9|\xD8\x3D");
    const char* const encoding = anyConverter(input);
    if (dependsOnPieces(encoding, true)) return;
    std::string bytes = input.text(parts, 30);
    for (std::size_t more = input.below(20); more > 0; --more)
        bytes += static_cast<char>(input.number(1));
    const std::string where = std::string(encoding) + " of " + bytes;
    const std::u16string found = decodedInSteps(input, encoding, bytes);
    requireEqual(bytesOf(found), bytesOf(decodedAtOnce(encoding, bytes)), where);
    input.observe(bytesOf(found));
}

// Nor for what it encodes to, and that can be read again.
void encoding(Bytes& input) {
    static const std::u16string parts[] = {u"a",      u"\n",     u"\u00E9", u"\u3042",
                                           u"\u30A2", u"\u0416", u"\xFFFD", u"\U0001F600",
                                           u"\xD83D", u"\xDE01"};
    const char* const name = anyConverter(input);
    std::u16string text;
    for (std::size_t count = input.below(60); count > 0; --count) {
        const bool isPart = input.below(2) == 0;
        text +=
            isPart ? input.of(parts) : std::u16string(1, static_cast<char16_t>(input.number(2)));
    }
    const std::string where = name + (" of " + bytesOf(text));
    const std::string bytes = encodedInPieces(input, name, text);
    if (!text.empty() && !dependsOnPieces(name, false))
        requireEqual(bytes, encodedAtOnce(name, text), where);
    input.observe(bytes);
    if (dependsOnPieces(name, true)) return;
    requireEqual(bytesOf(decodedInSteps(input, name, bytes)), bytesOf(decodedAtOnce(name, bytes)),
                 where + " and back");
}

}  // namespace properties
