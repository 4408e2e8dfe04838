#include "fileio/host/text.h"
#include "fileio/text/input_string_stream.h"
#include "tests/oracle/scan_oracle.h"
#include "tests/properties/properties.h"
#include "tests/support/test_files.h"

#include <algorithm>
#include <bit>
#include <cerrno>
#include <cstdlib>

// The scan operations of streams against what the C library makes of the same fields.

namespace properties {
namespace {

using namespace oracle;

// All that shows of a stream between two operations.
std::string describe(std::FILE* file, int errorCode, const Outcome& out) {
    return out.describe() + " code " + std::to_string(errorCode) + " at " +
           std::to_string(std::ftell(file)) + " eof " + std::to_string(std::feof(file) != 0) +
           " error " + std::to_string(std::ferror(file) != 0);
}

std::string readRest(std::FILE* file) {
    std::string rest;
    for (int byte = std::getc(file); byte != EOF; byte = std::getc(file))
        rest += static_cast<char>(byte);
    return rest;
}

bool isBlank(char byte) {
    return byte == '\0' ||
           qzu_isbreakablespace(static_cast<char16_t>(static_cast<signed char>(byte)));
}

double referenceFloat(const std::string& text, long& taken) {
    const std::size_t digits = text.find_first_not_of("+-");
    double value = 0;
    if (digits <= 1 && (text.compare(digits, 2, "0x") == 0 || text.compare(digits, 2, "0X") == 0)) {
        auto n = static_cast<std::size_t>(std::find_if(text.begin(), text.end(), isBlank) -
                                          text.begin());
        if (text[n - 1] == 'e' || text[n - 1] == 'E') --n;
        std::sscanf(text.c_str(), ("%" + std::to_string(n) + "le%ln").c_str(), &value, &taken);
    } else {
        char* end = nullptr;
        value = std::strtod(text.c_str(), &end);
        taken = end - text.c_str();
    }
    return value;
}

std::string describe(const Outcome& out, long position) {
    return out.describe() + " at " + std::to_string(position);
}

// The C library's own functions over a terminated copy of the field. The flag begins as true.
std::string reference(Operation operation, const std::string& text, long width) {
    const auto blanks = std::find_if_not(text.begin(), text.end(), isBlank) - text.begin();
    if (blanks == std::ssize(text)) return describe({0, 0, true}, blanks);
    const std::string field =
        text.substr(static_cast<std::size_t>(blanks), static_cast<std::size_t>(width));
    Outcome out;
    long taken = 0;
    if (operation == Float) {
        out.bits = std::bit_cast<unsigned long>(referenceFloat(field, taken));
    } else {
        char* end = nullptr;
        out = wholeNumber(operation, field.c_str(), &end);
        taken = end - field.c_str();
    }
    if (taken == 0) out.status = -9;
    if (operation == Integer || operation == CouldBeHex || operation == Float) out.flag = true;
    return describe(out, blanks + taken);
}

}  // namespace

// Several operations on two files of the same content, one of them read by fscanf alone.
void fileFields(Bytes& input) {
    Fields fields(input);
    const bool canSeek = input.below(2) == 0;
    const std::size_t bufferSize = input.below(2) == 0 ? 1 + input.below(40) : 4096;
    std::size_t steps = 1 + input.below(4);
    const std::string text = fields.text(1 + input.below(12));
    support::FaultyFile one{.bytes = text, .failingSeek = canSeek ? 0 : 1, .error = ESPIPE};
    support::FaultyFile two = one;
    support::OpenedFile first(one.open("r", bufferSize), "r"),
        second(two.open("r", bufferSize), "r");
    Orvandeil::FileIO::fileStream& stream = first.stream;
    int errorCode = 0;
    for (; steps > 0; --steps) {
        const Operation operation = fields.operation();
        const long width = fields.width();
        const int status = operation == Float ? fields.entryStatus() : INT_MAX;
        const Outcome found = scanWith(stream, operation, width, status, false);
        const Outcome wanted = scanByFscanf(second.file, operation, width, status, errorCode);
        const std::string seen = describe(first.file, stream.getErrorCode(), found);
        requireEqual(seen, describe(second.file, errorCode, wanted),
                     "operation " + std::to_string(operation) + " width " + std::to_string(width) +
                         " entry " + std::to_string(status) + " of " + text);
        input.observe(seen);
        // Read on behind what is no number of any kind.
        if (found.status != INT_MAX && std::getc(first.file) != std::getc(second.file))
            throw Broken("the files go on differently: " + text);
    }
    requireEqual(readRest(first.file), readRest(second.file), "the rest of " + text);
}

void textFields(Bytes& input) {
    Fields fields(input);
    const Operation operation = fields.operation();
    const long width = fields.width();
    const std::string text = fields.text(input.below(8));
    Orvandeil::FileIO::inputStringStream stream(text.c_str(), std::ssize(text), "");
    const Outcome out = scanWith(stream, operation, width, INT_MAX, true);
    long position = -1;
    stream.getPosition(position);
    requireEqual(
        describe(out, position), reference(operation, text, width),
        "operation " + std::to_string(operation) + " width " + std::to_string(width) + ": " + text);
    input.observe(describe(out, position));
}

}  // namespace properties
