#include "tests/properties/properties.h"

namespace properties {
namespace {

#define FILEIO_LIST_PROPERTY(name) {#name, name},
constexpr Property list[] = {FILEIO_FOR_EACH_PROPERTY(FILEIO_LIST_PROPERTY)};
#undef FILEIO_LIST_PROPERTY

}  // namespace

std::span<const Property> all() {
    return list;
}

}  // namespace properties
