#pragma once

#include "cli/report.h"
#include "fileio/host/arrays.h"

namespace cli {

// Prints an array as lines of UTF-8: one matrix row a line, columns separated by a tab, each number
// in the shortest text that reads back exactly. Further dimensions follow as further columns. Rows
// of a char array are text. A string array shows one element a line, a missing one as <missing>.
void printPlain(const vxArray& array, Report& report);

}  // namespace cli
