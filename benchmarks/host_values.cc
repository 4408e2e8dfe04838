#include "benchmarks/host_values.h"

#include "fileio/buffers/output_buffer.h"
#include "fileio/printf/printf_controller.h"
#include "fileio/scanf/scan_control.h"
#include "fileio/text/input_string_stream.h"
#include "fileio/text/output_string_stream.h"

namespace bench {

using namespace Orvandeil::FileIO;

Printed printed(const std::u16string& format, std::span<const vxArray*> arrays) {
    outputStringStream out("");
    printfController controller(format, &out, arrays.data(), static_cast<int>(arrays.size()));
    controller.doPrintf();
    long bytes = 0;
    out.getPosition(bytes);
    return {detail::HostBytes(static_cast<char*>(out.transferBuffer())),
            static_cast<std::size_t>(bytes) / sizeof(char16_t)};
}

void printToBlock(Trial& trial, const std::u16string& format,
                  std::span<const vxArray* const> arrays) {
    std::vector<const vxArray*> arguments(arrays.begin(), arrays.end());
    const Printed result = trial.time([&] { return printed(format, arguments); });
    trial.result(result.text());
}

ArrayPtr scanned(const std::string& text, const std::u16string& format) {
    // Chunks as the built-ins take them.
    constexpr std::size_t usualChunk = 4;
    constexpr std::size_t largestChunk = 1 << 23;
    inputStringStream stream(text.c_str(), static_cast<long>(text.size()), "UTF-8");
    finFormatParser parser(format.c_str(), &stream);
    parser.InitFormatPieces();
    OutputBuffer values(parser.getResultClass(), usualChunk, usualChunk, largestChunk);
    unsigned long count = 0;
    scanControl control(0, true, count, stream, parser, values);
    control.performMainScan();
    return ArrayPtr(values.TransferArray());
}

void scanBytes(Trial& trial, const std::string& text, const std::u16string& format) {
    const ArrayPtr array = trial.time([&] { return scanned(text, format); });
    resultOfArray(trial, *array);
}

void resultOfArray(Trial& trial, const vxArray& array) {
    const std::size_t count = embedded::elementCount(array);
    const void* const data = vxArrayData(&array);
    if (vxArrayClassID(&array) == vxCHAR_CLASS) {
        trial.result(std::u16string_view(static_cast<const char16_t*>(data), count));
        return;
    }
    trial.result(std::string_view(static_cast<const char*>(data),
                                  count * embedded::elementBytes(vxArrayClassID(&array))));
}

}  // namespace bench
