#pragma once

#include <cmath>
#include <limits>

namespace Orvandeil::FileIO {

// Says which numbers a "*" may stand for, and which code a bad one is.
class FieldValidator {
public:
    virtual ~FieldValidator() = default;
    // The value truncated toward zero; throws the code of a value that is no 32-bit integer.
    virtual int validate(double value) const = 0;
    // The code for an argument without elements.
    virtual int emptyArgumentCode() const = 0;
};

// The arguments are the codes, negated.
template <int NaN, int Inf, int NegInf, int Int, int Empty>
class FieldValidatorT final : public FieldValidator {
public:
    int validate(double value) const override {
        if (std::isnan(value)) throw -NaN;
        if (std::isinf(value)) throw value > 0 ? -Inf : -NegInf;
        if (value < std::numeric_limits<int>::min() || value > std::numeric_limits<int>::max()) {
            throw -Int;
        }
        return static_cast<int>(value);
    }
    int emptyArgumentCode() const override { return -Empty; }
};

}  // namespace Orvandeil::FileIO
