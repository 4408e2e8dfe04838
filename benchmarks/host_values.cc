#include "benchmarks/host_values.h"

#include "fileio/buffers/host_block.h"
#include "fileio/printf/printf_controller.h"
#include "fileio/text/output_string_stream.h"

namespace bench {

using namespace Orvandeil::FileIO;

void printToBlock(Trial& trial, const std::u16string& format,
                  std::span<const vxArray* const> arrays) {
    std::vector<const vxArray*> arguments(arrays.begin(), arrays.end());
    long bytes = 0;
    const detail::HostBytes block = trial.time([&] {
        outputStringStream out("");
        printfController controller(format, &out, arguments.data(),
                                    static_cast<int>(arguments.size()));
        controller.doPrintf();
        out.getPosition(bytes);
        return detail::HostBytes(static_cast<char*>(out.transferBuffer()));
    });
    trial.result(std::u16string_view(reinterpret_cast<const char16_t*>(block.get()),
                                     static_cast<std::size_t>(bytes) / sizeof(char16_t)));
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
