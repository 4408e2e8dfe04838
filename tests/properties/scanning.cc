#include "tests/support/scanning.h"

#include "fileio/text/input_string_stream.h"
#include "tests/properties/properties.h"
#include "tests/support/printing.h"
#include "tests/support/test_files.h"
#include "tests/text/memory_stream.h"

#include <cerrno>
#include <cstdio>

namespace properties {
namespace {

using namespace Orvandeil::FileIO;
using support::Scanned;

struct UnknownStringStream : inputStringStream {
    using inputStringStream::inputStringStream;
};
struct UnknownFileStream : fileStream {
    using fileStream::fileStream;
};

constexpr const char* encodings[] = {"UTF-8", "", "ISO-8859-1", "UTF-16LE", "Shift_JIS", "UTF-8"};

// What shows of a scan, then what is left of the input.
template <class Stream>
std::string finish(Stream& stream, const Scanned& scanned) {
    std::u16string rest;
    stream.GetNCodePoints(rest, 1000, nullptr);
    return scanned.summary() + " result " + std::to_string(scanned.result) + " error " +
           std::to_string(stream.getErrorCode()) + " end " + std::to_string(stream.EndOfData()) +
           " rest " + bytesOf(rest);
}

template <class Stream>
std::string scanText(const std::string& text, const std::string& encoding,
                     const std::string& format, long limit) {
    Stream stream(text.c_str(), std::ssize(text), encoding);
    const Scanned scanned = support::scan(stream, format, limit);
    if (scanned.position > std::ssize(text)) throw Broken("read beyond the end: " + text);
    return finish(stream, scanned);
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
                     const std::string& format, long limit, std::size_t bufferSize,
                     bool canSeek = true, bool readsOn = false) {
    support::FaultyFile memory{.bytes = text, .failingSeek = canSeek ? 0 : 1, .error = ESPIPE};
    std::FILE* const file = memory.open("r", bufferSize);
    FilePermission permission;
    std::string seen;
    {
        Stream stream(file, encoding.empty() ? "UTF-8" : encoding, permission, u"");
        const Scanned scanned = support::scan(stream, format, limit);
        if (readsOn) seen = readOn(stream, format);
        seen += finish(stream, scanned);
    }
    std::fclose(file);
    return seen;
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
    const std::string text = input.text(texts, 60), where = format + " over " + text;
    const std::string seen = scanText<inputStringStream>(text, encoding, format, limit);
    requireEqual(seen, scanText<UnknownStringStream>(text, encoding, format, limit), where);
    const std::string inFile = scanFile<fileStream>(text, encoding, format, limit, bufferSize);
    requireEqual(inFile, scanFile<UnknownFileStream>(text, encoding, format, limit, bufferSize),
                 where + " in a file");
    input.observe(seen + inFile);
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
    requireEqual(scanFile<fileStream>(bytes, name, format, limit, readAhead, canSeek, true),
                 scanFile<UnknownFileStream>(bytes, name, format, limit, readAhead, canSeek, true),
                 where + " in turn with lines, in " + name);
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
    const std::string seen = scanText<inputStringStream>(text, "UTF-8", format, -1);
    requireEqual(scanFile<fileStream>(text, "UTF-8", format, -1, bufferSize), seen, whole);
    const std::string count = " #" + std::to_string(stored) + ' ';
    if ((' ' + seen).find(count) == seen.npos) throw Broken(whole + "\n  gives  " + seen);
    input.observe(seen);
}

}  // namespace properties
