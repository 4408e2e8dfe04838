#include "fileio/printf/conversion_token.h"

namespace Orvandeil::FileIO::detail {
namespace {

constexpr std::u16string_view digits = u"0123456789";
constexpr std::u16string_view leadingDigits = u"123456789";

// Takes parts off the front of a text.
class Taker {
public:
    explicit Taker(std::u16string_view format) : rest(format) {}

    std::u16string_view takeLength(std::size_t length) {
        const std::u16string_view taken = rest.substr(0, length);
        rest.remove_prefix(taken.size());
        return taken;
    }
    std::u16string_view takeAll(std::u16string_view set) { return takeLength(runOf(set, 0)); }
    std::u16string_view takeOne(std::u16string_view set) {
        return takeLength(isAt(0, set) ? 1 : 0);
    }

    std::u16string_view takeNumbered() { return takeLength(numberedLength(0)); }
    std::u16string_view takeWidth() {
        if (isAt(0, u"*")) return takeLength(1 + numberedLength(1));
        return isAt(0, leadingDigits) ? takeAll(digits) : std::u16string_view();
    }
    std::u16string_view takePrecision() {
        if (!isAt(0, u".")) return {};
        if (isAt(1, u"*")) return takeLength(2 + numberedLength(2));
        const std::size_t sign = isAt(1, u"-") ? 1 : 0;
        return takeLength(1 + sign + runOf(digits, 1 + sign));
    }

private:
    bool isAt(std::size_t offset, std::u16string_view set) const {
        return offset < rest.size() && set.find(rest[offset]) != set.npos;
    }
    std::size_t runOf(std::u16string_view set, std::size_t offset) const {
        std::size_t end = offset;
        while (isAt(end, set))
            ++end;
        return end - offset;
    }
    // The length of "digits$" at the offset; without the "$" it is no reference at all.
    std::size_t numberedLength(std::size_t offset) const {
        if (!isAt(offset, leadingDigits)) return 0;
        const std::size_t run = runOf(digits, offset);
        return isAt(offset + run, u"$") ? run + 1 : 0;
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
    token.flags = count(taker.takeAll(u"-+ #0"));
    token.width = count(taker.takeWidth());
    token.precision = count(taker.takePrecision());
    token.modifier = count(taker.takeOne(u"hlbt"));
    token.conversion = count(taker.takeOne(u"diouxXeEfgGsc%"));
    token.whole = format.substr(position, length);
    return token;
}

}  // namespace Orvandeil::FileIO::detail
