#pragma once

#include "fileio/host/arrays.h"

#include <string>

namespace cli {

// An array as lines of UTF-8: one matrix row a line, columns separated by a tab, each number in
// the shortest text that reads back exactly. Further dimensions follow as further columns. Rows of
// a char array are text. A string array shows one element a line, a missing one as <missing>.
std::string plainText(const vxArray& array);

}  // namespace cli
