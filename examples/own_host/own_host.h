#pragma once

#include "fileio/host/arrays.h"

#include <cstddef>
#include <initializer_list>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

// A host in a few hundred lines, to start one's own from. It differs from the embedded host
// wherever the boundary leaves room: arrays are plain structures in the host's own counted and
// limited memory and know nothing of their imaginary parts, narrow text is Latin-1, messages are
// bare identifiers, and errors are thrown by whoever raises them.
namespace own_host {

struct Destroyer {
    void operator()(vxArray* array) const noexcept { vxArrayDestroy(array); }
};
using Array = std::unique_ptr<vxArray, Destroyer>;

// `values` in column-major order, rows × columns of them.
Array doubles(std::size_t rows, std::size_t columns, std::initializer_list<double> values);
Array chars(std::u16string_view text);
// A string array in one row; null stands for a missing text.
Array strings(std::initializer_list<const char16_t*> texts);

// The imaginary parts of a complex array, laid out as the real ones.
void* imaginaryParts(const vxArray* array);

// Blocks and bytes in use, and the bytes that may be.
struct Memory {
    std::size_t blocks = 0;
    std::size_t bytes = 0;
    std::size_t limit = 64 << 20;
};
Memory& memory();

// The identifiers of the warnings issued so far.
std::vector<std::string>& warnings();

// What the console showed since the last call: its output, and its errors and messages.
std::string takeOutput();
std::string takeErrors();

}  // namespace own_host
