#include "tests/support/scanning.h"

#include "fileio/text/input_string_stream.h"
#include "tests/oracle/scan_oracle.h"
#include "tests/properties/properties.h"
#include "tests/support/printing.h"
#include "tests/support/test_files.h"
#include "tests/text/memory_stream.h"

#include <cerrno>
#include <cstdio>
#include <cstring>

namespace properties {
namespace {

using namespace Orvandeil::FileIO;
using namespace std::string_literals;
using support::Scanned;
using support::Unknown;

constexpr const char* encodings[] = {"UTF-8", "", "ISO-8859-1", "UTF-16LE", "Shift_JIS", "UTF-8"};

// How a text is scanned: what is read ahead of a file, whether it can seek, whether lines and more
// scans follow, the bytes to step back over then, and the least chunk of the result.
struct Way {
    long limit = -1;
    std::size_t readAhead = 1;
    bool canSeek = true, readsOn = false;
    unsigned long back = 0;
    std::size_t chunk = 4;
};

// What shows of a scan, then what is left of the input.
std::string finish(TcodnStream& stream, const Scanned& scanned, const Way& way) {
    std::string seen = scanned.summary();
    for (const long number : {long{scanned.result}, static_cast<long>(scanned.conversions),
                              static_cast<long>(scanned.nextIndex), long{scanned.isRecycled},
                              long{stream.getErrorCode()}, long{stream.EndOfData()},
                              long{way.back == 0 || stream.Rewind(way.back)}})
        seen += ' ' + std::to_string(number);
    std::u16string rest;
    stream.GetNCodePoints(rest, 1000, nullptr);
    return seen + " rest " + bytesOf(rest);
}

template <class Stream>
std::string scanText(const std::string& text, const std::string& encoding,
                     const std::string& format, const Way& way) {
    Stream stream(text.c_str(), std::ssize(text), encoding);
    const Scanned scanned = support::scan(stream, format, way.limit, way.chunk);
    if (scanned.position > std::ssize(text)) throw Broken("read beyond the end: " + text);
    return finish(stream, scanned, way);
}

// Lines and scans in turn.
std::string readOn(fileStream& stream, const std::string& format) {
    std::string seen;
    for (int turn = 0; turn < 6; ++turn) {
        OutputBuffer line(vxCHAR_CLASS, 16, turn % 3 == 0 ? 16 : 200, 64);
        seen += " line " + std::to_string(stream.GetLine(turn % 2 == 0 ? -1 : 7, line)) + ' ';
        const std::size_t units = line.GetSize();
        const auto text = line.Transfer();
        if (units != 0) seen += bytesOf({static_cast<const char16_t*>(text.get()), units});
        seen += ' ' + support::scan(stream, format, 2).summary() + ' ' +
                std::to_string(stream.EndOfData());
    }
    return seen;
}

template <class Stream>
std::string scanFile(const std::string& text, const std::string& encoding,
                     const std::string& format, const Way& way) {
    support::FaultyFile memory{.bytes = text, .failingSeek = way.canSeek ? 0 : 1, .error = ESPIPE};
    support::StreamOver<Stream> opened(memory.open("r", way.readAhead), "r",
                                       encoding.empty() ? "UTF-8" : encoding);
    const Scanned scanned = support::scan(opened.stream, format, way.limit, way.chunk);
    const std::string seen = way.readsOn ? readOn(opened.stream, format) : "";
    return seen + finish(opened.stream, scanned, way);
}

// By streams that the library knows, which must do what the same streams do that it does not know.
std::string scanBoth(const std::string& text, const std::string& encoding,
                     const std::string& format, const Way& way) {
    const std::string where = format + " over " + text + " in " + encoding;
    const std::string seen = scanText<inputStringStream>(text, encoding, format, way);
    requireEqual(seen, scanText<Unknown<inputStringStream>>(text, encoding, format, way), where);
    const std::string inFile = scanFile<fileStream>(text, encoding, format, way);
    requireEqual(inFile, scanFile<Unknown<fileStream>>(text, encoding, format, way),
                 where + " in a file");
    return seen + inFile;
}

// A field that files and texts read alike, behind the conversion for it.
struct Field {
    std::string conversion, text;
};

Field anyField(Bytes& input) {
    static const char* const formats[][2] = {
        {"%d", "%ld"},       {"%ld", "%ld"}, {"%hd", "%ld"}, {"%x", "%lx"},
        {"%lx", "0x%lX"},    {"%o", "0%lo"}, {"%i", "%ld"},  {"%li", "0x%lx"},
        {"%u", "%lu"},       {"%lu", "%lu"}, {"%f", "%.3f"}, {"%g", "%.15g"},
        {"%hf", "%.2e"},     {"%s", "w%ld"}, {" %c", "c"},   {" %[a-f]", "fade"},
        {" %3[^0-9]", "-+x"}};
    const auto& format = input.of(formats);
    const bool isReal = format[0][1] == 'f' || format[0][1] == 'g' || format[0][2] == 'f';
    const auto shift = static_cast<long>(input.below(64));
    const auto whole = static_cast<long>(input.number(8)) >> shift;
    const double real = input.real();
    char text[400];
    if (isReal)
        std::snprintf(text, sizeof text, format[1], real - real == 0 ? real : 0);
    else
        std::snprintf(text, sizeof text, format[1], whole);
    std::string conversion = format[0];
    if (input.below(8) == 0) conversion.insert(conversion.find('%') + 1, "*");
    return {conversion, text};
}

const std::string programs[] = {"%d",          "%d,%d",      "%hd %hu,%u",    "%ld",
                                "%lu",         "%lu%ld",     "%f;%hf\n",      "a %d , b%fc",
                                "%d%%%f",      "%d%*f",      "%*d %u",        "%f%*[,;]",
                                "%3d%f",       "%d%s",       "%i %d ",        "x%*f y%*dz%d",
                                "%hf\t%ld",    "%d\u00E9%f", "%f\u2003%d",    "%f ",
                                "%s",          "%3s%d",      "%s%2c",         "%[^,],",
                                "%4[^,\n]%*c", "%c",         "%*s %3c",       "%*[^ ]%u",
                                "%[0-9]%s",    "%5s,%hf",    "%*[^a]%[]a-f]", "%[acegikmo4]%c",
                                "%[^\u00E9-a]"};

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

}  // namespace

// Any format over any text, through a stream that the library knows and one that it does not.
void scanning(Bytes& input) {
    static const std::string formats[] = {"%d", "%f",   "%s",  "%c",  "%[^,]",  "%x",  " ",  ",",
                                          "%i", "%5",   "%*",  "%ld", "%hu",    "%lx", "%o", "%%",
                                          "%",  "%[a-", "]",   "%2d", "%3s",    "%g",  "é",  "\n",
                                          "%u", "%*d",  "%he", "%2c", "%*[^\n]"};
    static const std::vector<std::string> texts = split(
        "1|-2.5| |,|\n|0x1F|abc|é|€|1e5|Inf|nan|\t|12|%|\r\n|\xFF|07|65536|+|\xF0\x9F\x98\x80|"
        "3;4");
    const std::string format = input.text(formats, 8), encoding = input.of(encodings);
    const long limit = input.below(3) == 0 ? static_cast<long>(input.below(9)) : -1;
    const std::size_t bufferSize = 1 + input.below(20);
    const std::string text = input.text(texts, 60);
    input.observe(scanBoth(text, encoding, format, {limit, bufferSize}));
    if (input.empty()) return;
    // The same text in any encoding, by scans and lines in turn, from what may be a pipe.
    const std::string name = input.of(statelessEncodings);
    MemoryStream encoder(name);
    encoder.PutString(fileio_tests::toUtf16(text));
    const bool canSeek = input.below(2) == 0;
    const std::size_t readAhead = 1 + input.below(100);
    std::string bytes = encoder.output;
    for (std::size_t faults = input.below(3); faults > 0 && !bytes.empty(); --faults)
        bytes[input.below(256) % bytes.size()] = "\xC3\xFF\x81\0,"[input.below(5)];
    scanBoth(bytes, name, format, {limit, readAhead, canSeek, true});
}

// Any format over a text that it mostly reads, and a step back.
void scanPrograms(Bytes& input) {
    static const std::string names[] = {"", "UTF-8", "ISO-8859-1", "Shift_JIS", "UTF-16LE"};
    Inputs inputs(input);
    const std::string &format = input.of(programs), &encoding = input.of(names);
    Way way;
    way.limit = input.below(3) == 0 ? -1 : static_cast<long>(input.below(20));
    way.canSeek = input.below(2) == 0;
    way.readAhead = 1 + input.below(input.below(2) == 0 ? 60 : 200);
    way.back = 1 + input.below(3);
    way.chunk = input.below(2) == 0 ? 4 : 64;
    input.observe(scanBoth(inputs.text(format, input.below(40)), encoding, format, way));
}

// Formats with texts made for them: a file gives what a text gives, and every field is stored.
void fileScanning(Bytes& input) {
    static const std::string blanks[] = {" ", "\n", "  ", "\t", " \n\r", "\v\f"};
    std::string format, text;
    std::size_t stored = 0;
    for (std::size_t count = 1 + input.below(6); count > 0; --count) {
        const Field field = anyField(input);
        const bool isComma = input.below(4) == 0 && field.conversion.back() != 's';
        format += field.conversion + (isComma ? "," : " ");
        text += field.text + (isComma ? "," : input.of(blanks));
        stored += field.conversion.find('*') == field.conversion.npos;
    }
    const std::size_t bufferSize = 1 + input.below(50);
    const std::string whole = format + " over " + text;
    const Way way = {.readAhead = bufferSize};
    const std::string seen = scanText<inputStringStream>(text, "UTF-8", format, way);
    requireEqual(scanFile<fileStream>(text, "UTF-8", format, way), seen, whole);
    const std::string count = " #" + std::to_string(stored) + ' ';
    if ((' ' + seen).find(count) == seen.npos) throw Broken(whole + "\n  gives  " + seen);
    input.observe(seen);
}

}  // namespace properties
