#pragma once

#include "fileio/streams/stream.h"
#include "tests/properties/bytes.h"

#include <climits>
#include <cstdio>
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

// Numbers, what nearly are numbers, and ways to scan them.
class Fields {
public:
    explicit Fields(properties::Bytes& bytes) : input(bytes) {}

    Operation operation() { return static_cast<Operation>(input.below(operationCount)); }
    int entryStatus() {
        return input.below(8) == 0 ? static_cast<int>(input.below(2)) * 5 : INT_MAX;
    }
    long width();
    std::string text(std::size_t tokens);

private:
    properties::Bytes& input;
};

}  // namespace oracle
