#pragma once

#include <stdexcept>
#include <string>

namespace Orvandeil::FileIO::embedded {

// A numeric code, errno values included, and where it happened.
struct Failure {
    int code = 0;
    std::string place;
};

// A failure that ends a built-in before it has transferred anything.
class CodeError : public std::runtime_error {
public:
    explicit CodeError(const Failure& failure) : CodeError(failure.code, failure.place) {}
    CodeError(int numericCode, const std::string& place)
        : std::runtime_error(place), code(numericCode) {}

    const int code;
};

}  // namespace Orvandeil::FileIO::embedded
