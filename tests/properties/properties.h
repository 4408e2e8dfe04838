#pragma once

#include "tests/properties/bytes.h"

#include <span>

// What holds whatever the input. Each property is a function that turns bytes into a case and
// throws Broken when the case shows that it does not hold. The bytes come from a corpus, from a
// generator, or from a fuzzer.
namespace properties {

// clang-format off
#define FILEIO_FOR_EACH_PROPERTY(X)                                                            \
    X(escapes) X(printing) X(scanning) X(fileScanning) X(scanPrograms) X(fileFields)           \
    X(textFields) X(attributes) X(values) X(decoding) X(encoding) X(lines) X(bitFields)        \
    X(npyHeaders) X(conversions)
// clang-format on

#define FILEIO_DECLARE_PROPERTY(name) void name(Bytes& input);
FILEIO_FOR_EACH_PROPERTY(FILEIO_DECLARE_PROPERTY)
#undef FILEIO_DECLARE_PROPERTY

struct Property {
    const char* name;
    void (*check)(Bytes& input);
};
std::span<const Property> all();

}  // namespace properties
