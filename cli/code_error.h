#pragma once

#include <stdexcept>
#include <string>

namespace cli {

// A numeric code (errno values included) that ends a verb. The text says where it happened.
class CodeError : public std::runtime_error {
public:
    CodeError(int numericCode, const std::string& place)
        : std::runtime_error(place), code(numericCode) {}

    const int code;
};

}  // namespace cli
