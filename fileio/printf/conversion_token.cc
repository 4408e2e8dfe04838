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
    Taker(const char16_t* from, const char16_t* to) : next(from), end(to) {}

    const char16_t* place() const { return next; }
    bool isAtLetter() const { return isAt(next, ConversionLetter); }

    std::u16string_view takeAll(CharacterSet set) { return takeTo(endOfRun(set, next)); }
    std::u16string_view takeOne(CharacterSet set) {
        return takeTo(next + (isAt(next, set) ? 1 : 0));
    }

    std::u16string_view takeNumbered() { return takeTo(endOfNumbered(next)); }
    std::u16string_view takeWidth() {
        if (isAt(next, Star)) return takeTo(endOfNumbered(next + 1));
        return takeTo(isAt(next, LeadingDigit) ? endOfRun(Digit, next) : next);
    }
    std::u16string_view takePrecision() {
        if (!isAt(next, Point)) return {};
        if (isAt(next + 1, Star)) return takeTo(endOfNumbered(next + 2));
        return takeTo(endOfRun(Digit, next + (isAt(next + 1, Sign) ? 2 : 1)));
    }

private:
    bool isAt(const char16_t* at, CharacterSet set) const {
        return at != end && *at < characterSets.size() && (characterSets[*at] & set) != 0;
    }
    const char16_t* endOfRun(CharacterSet set, const char16_t* at) const {
        while (isAt(at, set))
            ++at;
        return at;
    }
    // The end of "digits$"; without the "$" it is no reference at all.
    const char16_t* endOfNumbered(const char16_t* at) const {
        if (!isAt(at, LeadingDigit)) return at;
        const char16_t* const run = endOfRun(Digit, at);
        return run != end && *run == u'$' ? run + 1 : at;
    }
    std::u16string_view takeTo(const char16_t* to) {
        const std::u16string_view taken(next, static_cast<std::size_t>(to - next));
        next = to;
        return taken;
    }

    const char16_t* next;
    const char16_t* const end;
};

}  // namespace

ConversionToken tokenizeConversion(std::u16string_view format, std::size_t position) {
    const char16_t* const begin = format.data() + position;
    Taker taker(begin + 1, format.data() + format.size());
    // The parts in their order, of which most conversions have the last alone.
    std::u16string_view numbered, flags, width, precision, modifier;
    if (!taker.isAtLetter()) {
        numbered = taker.takeNumbered();
        flags = taker.takeAll(Flag);
        width = taker.takeWidth();
        precision = taker.takePrecision();
        modifier = taker.takeOne(Modifier);
    }
    const std::u16string_view conversion = taker.takeOne(ConversionLetter);
    const std::u16string_view whole(begin, static_cast<std::size_t>(taker.place() - begin));
    return {whole, numbered, flags, width, precision, modifier, conversion};
}

}  // namespace Orvandeil::FileIO::detail
