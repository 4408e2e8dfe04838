#pragma once

#include <cstddef>

// The bare loops that limits are made of: no checks, no calls, as wide as the machine has them.
namespace bench {

void widen(const char* from, std::size_t count, char16_t* to);

}  // namespace bench
