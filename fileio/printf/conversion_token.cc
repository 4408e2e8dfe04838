#include "fileio/printf/conversion_token.h"

#include <array>

namespace Orvandeil::FileIO::detail {
namespace {

// The parts that an ASCII character can belong to.
enum CharacterSet : unsigned char {
    Digit = 1,
    LeadingDigit = 2,
    Flag = 4,
    Modifier = 8,
    ConversionLetter = 16,
    Star = 32,
    Point = 64,
    Sign = 128
};

consteval std::array<unsigned char, 128> makeCharacterSets() {
    std::array<unsigned char, 128> sets{};
    const auto add = [&sets](std::string_view characters, CharacterSet set) {
        for (const char character : characters)
            sets[static_cast<unsigned char>(character)] |= set;
    };
    add("0123456789", Digit);
    add("123456789", LeadingDigit);
    add("-+ #0", Flag);
    add("hlbt", Modifier);
    add("diouxXeEfgGsc%", ConversionLetter);
    add("*", Star);
    add(".", Point);
    add("-", Sign);
    return sets;
}
constexpr std::array<unsigned char, 128> characterSets = makeCharacterSets();

// Takes parts off the front of a text.
class Taker {
public:
    explicit Taker(std::u16string_view format) : rest(format) {}

    std::u16string_view takeLength(std::size_t length) {
        const std::u16string_view taken = rest.substr(0, length);
        rest.remove_prefix(taken.size());
        return taken;
    }
    std::u16string_view takeAll(CharacterSet set) { return takeLength(runOf(set, 0)); }
    std::u16string_view takeOne(CharacterSet set) { return takeLength(isAt(0, set) ? 1 : 0); }

    std::u16string_view takeNumbered() { return takeLength(numberedLength(0)); }
    std::u16string_view takeWidth() {
        if (isAt(0, Star)) return takeLength(1 + numberedLength(1));
        return isAt(0, LeadingDigit) ? takeAll(Digit) : std::u16string_view();
    }
    std::u16string_view takePrecision() {
        if (!isAt(0, Point)) return {};
        if (isAt(1, Star)) return takeLength(2 + numberedLength(2));
        const std::size_t sign = isAt(1, Sign) ? 1 : 0;
        return takeLength(1 + sign + runOf(Digit, 1 + sign));
    }

private:
    bool isAt(std::size_t offset, CharacterSet set) const {
        return offset < rest.size() && rest[offset] < characterSets.size() &&
               (characterSets[rest[offset]] & set) != 0;
    }
    std::size_t runOf(CharacterSet set, std::size_t offset) const {
        std::size_t end = offset;
        while (isAt(end, set))
            ++end;
        return end - offset;
    }
    // The length of "digits$" at the offset; without the "$" it is no reference at all.
    std::size_t numberedLength(std::size_t offset) const {
        if (!isAt(offset, LeadingDigit)) return 0;
        const std::size_t run = runOf(Digit, offset);
        return offset + run < rest.size() && rest[offset + run] == u'$' ? run + 1 : 0;
    }

    std::u16string_view rest;
};

}  // namespace

ConversionToken tokenizeConversion(std::u16string_view format, std::size_t position) {
    ConversionToken token;
    Taker taker(format.substr(position));
    std::size_t length = taker.takeLength(1).size();
    const auto count = [&length](std::u16string_view part) {
        length += part.size();
        return part;
    };
    token.numbered = count(taker.takeNumbered());
    token.flags = count(taker.takeAll(Flag));
    token.width = count(taker.takeWidth());
    token.precision = count(taker.takePrecision());
    token.modifier = count(taker.takeOne(Modifier));
    token.conversion = count(taker.takeOne(ConversionLetter));
    token.whole = format.substr(position, length);
    return token;
}

}  // namespace Orvandeil::FileIO::detail
