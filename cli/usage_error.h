#pragma once

#include <stdexcept>

namespace cli {

// The command line itself is wrong. The message is shown on one line and the program ends with
// exit code 2, without a JSON object.
class UsageError : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

}  // namespace cli
