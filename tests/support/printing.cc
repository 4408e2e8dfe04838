#include "tests/support/printing.h"

#include "fileio/host/memory.h"
#include "fileio/host/text.h"
#include "fileio/printf/printf_controller.h"
#include "fileio/text/output_string_stream.h"

namespace fileio_tests {

using namespace Orvandeil::FileIO;

std::u16string toUtf16(std::string_view text) {
    return vxTextFromNarrow(text.data(), text.size());
}

std::string toUtf8(std::u16string_view text) {
    return vxTextToNarrow(text.data(), text.size());
}

std::string taken(outputStringStream& stream) {
    long bytes = 0;
    stream.getPosition(bytes);
    void* const block = stream.transferBuffer();
    const std::string text(static_cast<const char*>(block), static_cast<std::size_t>(bytes));
    vxMemoryFree(block);
    return text;
}

Printed print(std::string_view format, const std::vector<const vxArray*>& arguments) {
    outputStringStream out("");
    std::vector<const vxArray*> list = arguments;
    printfController controller(toUtf16(format), &out, list.data(), static_cast<int>(list.size()));
    Printed result;
    result.complete = controller.doPrintf();
    result.code = controller.getErrorCode();
    const std::string bytes = taken(out);
    std::u16string units(bytes.size() / 2, u'\0');
    bytes.copy(reinterpret_cast<char*>(units.data()), bytes.size());
    result.text = toUtf8(units);
    return result;
}

}  // namespace fileio_tests
