#include "examples/own_host/own_host.h"
#include "fileio/host/memory.h"
#include "fileio/host/text.h"
#include "fileio/printf/printf_controller.h"
#include "fileio/text/output_string_stream.h"

#include <cstdio>

// Prints a table with the library inside a host of one's own.
int main() {
    using namespace Orvandeil::FileIO;
    const own_host::Array table = own_host::doubles(3, 2, {1, 1, 2, 4, 3, 9});
    const vxArray* arguments[] = {table.get()};

    outputStringStream out("UTF-8");
    printfController controller(u"%d squared is %d\n", &out, arguments, 1);
    const bool complete = controller.doPrintf();
    long bytes = 0;
    out.getPosition(bytes);
    void* text = out.transferBuffer();
    std::fwrite(text, 1, static_cast<std::size_t>(bytes), stdout);
    vxMemoryFree(text);
    std::printf("%zu blocks of this host in use\n", own_host::memory().blocks);
    return complete ? 0 : 1;
}
