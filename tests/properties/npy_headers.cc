#include "embedded/npy/npy_file.h"
#include "embedded/npy/npy_header.h"
#include "tests/properties/properties.h"
#include "tests/support/arrays.h"
#include "tests/support/raised.h"
#include "tests/support/test_files.h"

namespace properties {
namespace {

using namespace Orvandeil::FileIO::embedded;

std::string describe(const NpyHeader& header) {
    std::string text =
        std::string(header.type->code) + (header.isFortranOrder ? " columns" : " rows");
    for (const std::size_t length : header.shape)
        text += ' ' + std::to_string(length);
    return text;
}

// What the whole file reads as.
std::string readFile(const std::string& content) {
    const support::MemoryFile file(content);
    std::string shown;
    const std::string raised =
        fileio_tests::raisedBy([&] { shown = support::shown(npyRead(file.path())); });
    return raised.empty() ? shown : raised.substr(0, raised.find(' '));
}

}  // namespace

// A header is refused as such, or says the same when it is written again. A file is read or
// refused, whatever its header promises, and its data are those behind the header.
void npyHeaders(Bytes& input) {
    static const std::vector<std::string> parts = split(
        "{~}~'descr'~: ~'<f8'~'fortran_order'~True~False~'shape'~(~)~,~2~3,~0~'|b1'~'>i2'~"
        "'c16'~{'descr': '<u2', ~'shape': (1, 2), ~'fortran_order': False, ~"
        "18446744073709551615~[~L~4294967296, ",
        '~');
    const std::string text = input.text(parts, 30);
    NpyHeader header;
    std::string raised = fileio_tests::raisedBy([&] { header = parseNpyHeader(text, "file"); });
    raised = raised.substr(0, raised.find(' '));
    if (!raised.empty() && raised != "KESTRA:npy:badHeader" &&
        raised != "KESTRA:npy:unsupportedType")
        throw Broken(raised + " for " + text);
    const auto length = static_cast<char>(text.size() & 0xFF);
    const std::string beginning =
        "\x93NUMPY" + std::string{1, 0, length, static_cast<char>(text.size() >> 8)} + text;
    const std::string seen = readFile(beginning + input.text(parts, 200));
    input.observe(raised + seen);
    if (!raised.empty()) return requireEqual(seen, raised, text);
    const std::string again = formatNpyHeader(header).substr(10);
    requireEqual(describe(parseNpyHeader(again, "file")), describe(header), text);
}

}  // namespace properties
