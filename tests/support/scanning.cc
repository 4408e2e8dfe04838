#include "tests/support/scanning.h"

#include "fileio/scanf/scan_control.h"
#include "fileio/text/input_string_stream.h"
#include "tests/support/printing.h"
#include "tests/support/test_files.h"

#include <cerrno>
#include <charconv>

namespace support {
namespace {

using namespace Orvandeil::FileIO;

template <class T>
void appendNumbers(OutputBuffer& buffer, std::string& out) {
    while (const void* element = buffer.GetNext()) {
        char text[40];
        const auto end = std::to_chars(text, std::end(text), *static_cast<const T*>(element)).ptr;
        if (!out.empty()) out += ' ';
        out.append(text, end);
    }
}

std::string valuesOf(OutputBuffer& buffer) {
    std::string out;
    buffer.ResetNext();
    switch (buffer.GetClassID()) {
        case vxDOUBLE_CLASS:
            appendNumbers<double>(buffer, out);
            return out;
        case vxINT64_CLASS:
            appendNumbers<long>(buffer, out);
            return out;
        case vxUINT64_CLASS:
            appendNumbers<unsigned long>(buffer, out);
            return out;
        default: {
            std::u16string text;
            while (const void* element = buffer.GetNext())
                text += *static_cast<const char16_t*>(element);
            return "'" + fileio_tests::toUtf8(text) + "'";
        }
    }
}

Scanned scanBytes(FaultyFile file, std::string_view format, long limit,
                  const std::string& encoding) {
    char readAhead[5];
    OpenedFile opened(file.open("r"), "r", encoding);
    std::setvbuf(opened.file, readAhead, _IOFBF, sizeof readAhead);
    return scan(opened.stream, format, limit);
}

}  // namespace

std::string Scanned::summary() const {
    std::string text = values.empty() ? "" : values + ' ';
    text += '#' + std::to_string(count) + " =" + std::to_string(code);
    if (position >= 0) text += " @" + std::to_string(position);
    return text;
}

Scanned scan(TcodnStream& stream, std::string_view format, long limit) {
    const std::u16string text = fileio_tests::toUtf16(format);
    finFormatParser parser(text.c_str(), &stream);
    parser.InitFormatPieces();
    OutputBuffer buffer(parser.getResultClass(), 4, 4, 64);
    Scanned scanned;
    scanControl control(limit < 0 ? 0 : static_cast<unsigned long>(limit), limit < 0, scanned.count,
                        stream, parser, buffer);
    scanned.result = control.performMainScan();
    scanned.code = control.getError();
    scanned.values = valuesOf(buffer);
    if (stream.getPosition(scanned.position) != 0) scanned.position = -1;
    return scanned;
}

Scanned scanFile(std::string_view input, std::string_view format, long limit,
                 const std::string& encoding) {
    return scanBytes({.bytes = std::string(input)}, format, limit, encoding);
}

Scanned scanPipe(std::string_view input, std::string_view format, long limit,
                 const std::string& encoding) {
    return scanBytes({.bytes = std::string(input), .failingSeek = 1, .error = ESPIPE}, format,
                     limit, encoding);
}

Scanned scanText(std::string_view input, std::string_view format, long limit,
                 const std::string& encoding) {
    const std::string text(input);
    inputStringStream stream(text.c_str(), static_cast<long>(text.size()), encoding);
    return scan(stream, format, limit);
}

}  // namespace support
