#include "tests/support/scanning.h"

#include "fileio/scanf/scan_control.h"
#include "fileio/text/input_string_stream.h"
#include "tests/support/arrays.h"
#include "tests/support/printing.h"
#include "tests/support/test_files.h"

namespace support {

using namespace Orvandeil::FileIO;

std::string Scanned::summary() const {
    std::string text = values.empty() ? "" : values + ' ';
    text += '#' + std::to_string(count) + " =" + std::to_string(code);
    if (position >= 0) text += " @" + std::to_string(position);
    return text;
}

Scanned scan(TcodnStream& stream, std::string_view format, long limit, std::size_t chunk) {
    const std::u16string text = fileio_tests::toUtf16(format);
    finFormatParser parser(text.c_str(), &stream);
    parser.InitFormatPieces();
    OutputBuffer buffer(parser.getResultClass(), chunk, chunk, 64);
    Scanned scanned;
    scanControl control(limit < 0 ? 0 : static_cast<unsigned long>(limit), limit < 0, scanned.count,
                        stream, parser, buffer);
    scanned.result = control.performMainScan();
    scanned.code = control.getError();
    scanned.conversions = control.getConversions();
    scanned.nextIndex = parser.getNextIndex();
    scanned.isRecycled = parser.isRecycled();
    const std::size_t size = buffer.GetSize();
    const vxClassID classID = buffer.GetClassID();
    const boost::shared_ptr<void> block = buffer.Transfer();
    const std::u16string_view units(static_cast<const char16_t*>(block.get()), size);
    scanned.values = classID == vxCHAR_CLASS ? "'" + fileio_tests::toUtf8(units) + "'"
                                             : listed(classID, block.get(), size);
    if (stream.getPosition(scanned.position) != 0) scanned.position = -1;
    return scanned;
}

Scanned scanFile(std::string_view input, std::string_view format, long limit) {
    FaultyFile file{.bytes = std::string(input)};
    OpenedFile opened(file.open("r", 5), "r", "UTF-8");
    return scan(opened.stream, format, limit);
}

Scanned scanText(std::string_view input, std::string_view format, long limit) {
    const std::string text(input);
    inputStringStream stream(text.c_str(), static_cast<long>(text.size()), "UTF-8");
    return scan(stream, format, limit);
}

}  // namespace support
