#pragma once

#include <climits>
#include <cstdio>
#include <string>

// The scan operations of a file stream, told once more with the scan formats of the C library. Slow
// and plain: what it does is what each format says.
namespace oracle {

enum Operation { Integer, CouldBeHex, Unsigned, Octal, Hex, Float, operationCount };

struct Outcome {
    unsigned long bits = 0;  // the value's
    int status = INT_MAX;
    bool flag = false;
    bool operator==(const Outcome&) const = default;
};

class FscanfReference {
public:
    explicit FscanfReference(std::FILE* source) : file(source) {}

    // `status` is the one on entry, which only Float looks at.
    Outcome scan(Operation operation, long width, int status);
    int getErrorCode() const { return errorCode; }

private:
    int nextBehindBlanks();
    void giveBack(std::string read);
    int failureCode();
    // Runs "%*<width>[<set>]%n" (no width when negative) and returns the characters taken.
    long skip(long width, const std::string& set);
    // Appends what "%<width>[<set>]%n" takes; false when nothing matched.
    bool read(long width, const std::string& set, std::string& field);
    Outcome integer(Operation operation, long width);
    bool collect(Operation operation, long width, std::string& field);
    Outcome floating(long width, int status);
    Outcome floatingNumber(long width, int sign);

    std::FILE* file;
    int errorCode = 0;
};

}  // namespace oracle
