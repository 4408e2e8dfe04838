#include "tests/properties/properties.h"

#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>

// A fuzzer calls this for every input it thinks of. What does not hold is a crash to it.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    properties::Bytes input({reinterpret_cast<const char*>(data), size});
    try {
        properties::FILEIO_PROPERTY(input);
    } catch (const properties::Broken& broken) {
        std::fprintf(stderr, "%s\n", broken.what());
        std::abort();
    }
    return 0;
}
