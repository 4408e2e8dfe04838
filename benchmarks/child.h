#pragma once

#include <cstdio>
#include <string>
#include <vector>

#include <sys/types.h>

namespace bench {

using Command = std::vector<std::string>;

// Runs a program to its end, found in PATH; its output goes to the file. Throws when it fails.
void runProgram(const Command& command, const std::string& outputPath);

// An interpreter with a script of peers, which stays between runs and times them itself. It is
// told a job in one line, fields separated by tabs, and answers in one line with the seconds, or
// with "error" and a reason. An interpreter that does not start or lacks what its script needs
// answers nothing.
class Interpreter {
public:
    explicit Interpreter(const Command& command);
    ~Interpreter();
    Interpreter(const Interpreter&) = delete;
    Interpreter& operator=(const Interpreter&) = delete;

    bool isThere() const { return there; }
    // The last field names the file for the result; "-" for none.
    double seconds(const std::vector<std::string>& fields);

private:
    std::string answer();

    pid_t process = -1;
    std::FILE* toChild = nullptr;
    std::FILE* fromChild = nullptr;
    bool there = false;
};

}  // namespace bench
