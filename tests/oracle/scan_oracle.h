#pragma once

#include "fileio/streams/stream.h"

#include <climits>
#include <cstdio>
#include <random>
#include <string>

// What the scan operations of streams have to give, told once more with the C library. Slow and
// plain.
namespace oracle {

enum Operation { Integer, CouldBeHex, Unsigned, Octal, Hex, Float, operationCount };

struct Outcome {
    unsigned long bits = 0;  // the value's
    int status = INT_MAX;
    bool flag = false;

    std::string describe() const;
};

// `status` and `flag` are those on entry.
Outcome scanWith(Orvandeil::FileIO::stream& from, Operation operation, long width, int status,
                 bool flag);

// A field by strtoll or strtoull, which also tell its end.
Outcome wholeNumber(Operation operation, const char* field, char** end);

// A scan of a file stream: what it does is what each format of fscanf says. Only Float looks at the
// status on entry. A failure stores its code.
Outcome scanByFscanf(std::FILE* file, Operation operation, long width, int status, int& errorCode);

// Random numbers, what nearly are numbers, and ways to scan them.
class Fields {
public:
    explicit Fields(unsigned seed) : random(seed) {}

    std::size_t below(std::size_t bound) { return random() % bound; }
    Operation operation() { return static_cast<Operation>(below(operationCount)); }
    int entryStatus() { return below(8) == 0 ? static_cast<int>(below(2)) * 5 : INT_MAX; }
    long width();
    std::string text(std::size_t tokens);

private:
    std::mt19937 random;
};

}  // namespace oracle
