#include "cli/plain_writer.h"

#include "cli/number_text.h"
#include "cli/utf8_slices.h"
#include "embedded/services/array.h"
#include "embedded/services/element_types.h"
#include "fileio/host/dispatch.h"

#include <span>
#include <string>
#include <string_view>

namespace cli {

namespace embedded = Orvandeil::FileIO::embedded;

namespace {

template <class T>
std::span<const T> elementsOf(const vxArray& array) {
    return {static_cast<const T*>(vxArrayData(&array)), embedded::elementCount(array)};
}

// Text on its way out, in a block of its own.
class Block {
public:
    explicit Block(Report& target) : report(target) {}

    // Room for one number and what follows it; end() takes what was put there.
    char* room() {
        if (static_cast<std::size_t>(text + sizeof text - next) <= longestNumber) flush();
        return next;
    }
    void end(char* newEnd) { next = newEnd; }

    void flush() {
        report.print({text, static_cast<std::size_t>(next - text)});
        next = text;
    }

private:
    Report& report;
    char text[16384];
    char* next = text;
};

template <class T>
void printNumbers(std::span<const T> elements, std::size_t rows, Report& report) {
    Block block(report);
    for (std::size_t row = 0; row < rows; ++row) {
        for (std::size_t i = row; i < elements.size(); i += rows) {
            char* const end = writeNumber(elements[i], block.room());
            *end = elements.size() - i > rows ? '\t' : '\n';
            block.end(end + 1);
        }
    }
    block.flush();
}

void printText(std::u16string_view text, Report& report) {
    forEachUtf8Slice(text, [&](std::string_view slice) { report.print(slice); });
    report.print("\n");
}

void printChars(std::span<const char16_t> units, std::size_t rows, Report& report) {
    if (rows == 1) return printText({units.data(), units.size()}, report);
    for (std::size_t row = 0; row < rows; ++row) {
        std::u16string line;
        for (std::size_t i = row; i < units.size(); i += rows)
            line += units[i];
        printText(line, report);
    }
}

void printStrings(const vxArray& array, Report& report) {
    for (std::size_t i = 0; i < embedded::elementCount(array); ++i) {
        const bool isMissing = vxStringArrayIsMissing(&array, i);
        printText(isMissing ? u"<missing>" : vxStringArrayText(&array, i), report);
    }
}

}  // namespace

void printPlain(const vxArray& array, Report& report) {
    if (vxStringArrayIs(&array)) return printStrings(array, report);
    const std::size_t rows = embedded::elementCount(array) == 0 ? 0 : vxArrayDimensions(&array)[0];
    const vxClassID classID = vxArrayClassID(&array);
    if (classID == vxCHAR_CLASS) return printChars(elementsOf<char16_t>(array), rows, report);
    embedded::withElementType(
        classID,
        [&]<class T>(embedded::ElementType<T>) {
            printNumbers(elementsOf<T>(array), rows, report);
        },
        [] {});
}

}  // namespace cli
