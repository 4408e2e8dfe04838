#pragma once

#include <string>
#include <vector>

// A transcript holds shell commands, each with what it prints:
//
//   $ fileio convert int8 300
//   127
//   $ fileio explain code x
//   ! fileio: "x" is no code: a whole number of 32 bits is
//   [2]
//
// Standard output stands below the command, standard error behind "! ", an exit status other than
// 0 in brackets. A line "#" and a blank begins a remark. A last line of output without an end is
// given one; blank lines at the end do not count. In Markdown, the same stands between ```console
// fences.
namespace transcript {

struct Case {
    std::string file;
    int line = 0;  // of the command
    std::string command;
    std::string expected;
};

std::vector<Case> read(const std::string& path);

// What the command prints, in the form of a transcript. It runs in an empty directory of its own
// where `bin/fileio` is `program`, which is also found as `fileio`.
std::string run(const std::string& command, const std::string& program);

}  // namespace transcript
