#include "fileio/scanf/scan_control.h"
#include "fileio/text/input_string_stream.h"
#include "tests/oracle/scan_oracle.h"
#include "tests/properties/properties.h"
#include "tests/support/arrays.h"
#include "tests/support/printing.h"
#include "tests/support/test_files.h"

#include <cerrno>
#include <cstring>

namespace properties {
namespace {

using namespace Orvandeil::FileIO;
using namespace std::string_literals;

// The driver of a derived class runs piece by piece.
struct PlainControl : scanControl {
    using scanControl::scanControl;
};

const std::string formats[] = {"%d",          "%d,%d",      "%hd %hu,%u",    "%ld",
                               "%lu",         "%lu%ld",     "%f;%hf\n",      "a %d , b%fc",
                               "%d%%%f",      "%d%*f",      "%*d %u",        "%f%*[,;]",
                               "%3d%f",       "%d%s",       "%i %d ",        "x%*f y%*dz%d",
                               "%hf\t%ld",    "%d\u00E9%f", "%f\u2003%d",    "%f ",
                               "%s",          "%3s%d",      "%s%2c",         "%[^,],",
                               "%4[^,\n]%*c", "%c",         "%*s %3c",       "%*[^ ]%u",
                               "%[0-9]%s",    "%5s,%hf",    "%*[^a]%[]a-f]", "%[acegikmo4]%c",
                               "%[^\u00E9-a]"};
const std::string encodings[] = {"", "UTF-8", "ISO-8859-1", "Shift_JIS", "UTF-16LE"};

// Text that a format reads well, with a fault now and then.
class Inputs : public oracle::Fields {
public:
    explicit Inputs(Bytes& bytes) : Fields(bytes), input(bytes) {}

    std::size_t below(std::size_t bound) { return input.below(bound); }
    std::string text(const std::string& format, std::size_t rounds) {
        std::string result;
        const std::size_t faults = 20 + below(200);
        for (; rounds != 0; --rounds) {
            for (std::size_t i = 0; i < format.size(); ++i) {
                if (below(faults) + 1 == faults) result += below(2) == 0 ? "\0"s : Fields::text(1);
                if ((format[i] == '%' || format[i] == ' ') && below(4) == 0)
                    result += " \n\t\v"[below(4)];
                if (format[i] == '%' && format[++i] != '%') {
                    i = format.find_first_of("dufisc[", i);
                    result += std::strchr("sc[", format[i]) == nullptr ? number() : word();
                    if (format[i] == '[') i = format.find(']', i + 3);
                } else {
                    result += format[i];
                }
            }
        }
        return result;
    }

private:
    // Mostly longer than what is looked at in one go, or mostly shorter.
    std::string word() {
        std::string result;
        const std::size_t others = below(3) == 0 ? 6 : 30;
        for (std::size_t n = 1 + below(below(5) == 0 ? 40 : 9); n != 0; --n)
            result += below(others) != 0 ? "abegmsxy0249"[below(12)] : ",. -]\n\xC3\xA9"[below(8)];
        return result;
    }
    std::string number() {
        std::string result = std::to_string(1 + below(9));
        for (std::size_t n = below(below(6) == 0 ? 30 : 9); n != 0; --n)
            result += static_cast<char>('0' + below(10));
        if (below(3) == 0) result.insert(below(result.size() + 1), ".");
        if (below(12) == 0) result += "e" + std::to_string(static_cast<long>(below(700)) - 350);
        if (below(3) == 0) result.insert(0, below(3) == 0 ? "+" : "-");
        return result + " "s.substr(below(2));
    }

    Bytes& input;
};

// Scans, steps back, and tells all that shows of it.
template <class Control>
std::string scanBy(TcodnStream& stream, const std::string& format, long limit, unsigned long back,
                   std::size_t chunk) {
    const std::u16string text = fileio_tests::toUtf16(format);
    finFormatParser parser(text.c_str(), &stream);
    parser.InitFormatPieces();
    OutputBuffer buffer(parser.getResultClass(), chunk, chunk, 64);
    unsigned long count = 0;
    Control control(static_cast<unsigned long>(limit), limit < 0, count, stream, parser, buffer);
    const bool result = control.performMainScan();
    const auto size = buffer.GetSize();
    std::string seen = support::listed(buffer.GetClassID(), buffer.Transfer().get(), size);
    long position = -1;
    for (const long number :
         {long{result}, static_cast<long>(count), long{control.getError()},
          static_cast<long>(control.getConversions()), static_cast<long>(parser.getNextIndex()),
          long{parser.isRecycled()}, long{stream.EndOfData()}, long{stream.getErrorCode()},
          long{stream.getPosition(position)}, position, long{stream.Rewind(back)}})
        seen += ' ' + std::to_string(number);
    char rest[64] = {};
    return seen + ' ' + std::string(rest, stream.GetNElements(sizeof rest, rest, 1));
}

}  // namespace

// A format run in one go does what its pieces do.
void scanPrograms(Bytes& input) {
    Inputs inputs(input);
    const std::string &format = input.of(formats), &encoding = input.of(encodings);
    const long limit = input.below(3) == 0 ? -1 : static_cast<long>(input.below(20));
    const bool canSeek = input.below(2) == 0;
    const std::size_t readAhead = 1 + input.below(input.below(2) == 0 ? 60 : 200);
    const unsigned long back = 1 + input.below(3);
    const std::size_t chunk = input.below(2) == 0 ? 4 : 64;
    const std::string text = inputs.text(format, input.below(40));
    const std::string where = format + " of " + text + " in " + encoding;
    const auto fromFile = [&](auto scan) {
        support::FaultyFile file{.bytes = text, .failingSeek = canSeek ? 0 : 1, .error = ESPIPE};
        support::OpenedFile opened(file.open("r", readAhead), "r", encoding);
        return scan(opened.stream, format, limit, back, chunk);
    };
    const auto fromText = [&](auto scan) {
        inputStringStream stream(text.c_str(), std::ssize(text), encoding);
        return scan(stream, format, limit, back, chunk);
    };
    const std::string seen = fromFile(scanBy<scanControl>) + fromText(scanBy<scanControl>);
    requireEqual(seen, fromFile(scanBy<PlainControl>) + fromText(scanBy<PlainControl>), where);
    input.observe(seen);
}

}  // namespace properties
