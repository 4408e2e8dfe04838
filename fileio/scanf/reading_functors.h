#pragma once

#include "fileio/scanf/vocabulary.h"
#include "fileio/streams/stream.h"

#include <algorithm>
#include <limits>

namespace Orvandeil::FileIO {

namespace detail {

// The value nearest to what a signed scan read.
template <class T>
T saturateSigned(long value) {
    constexpr long lowest = std::numeric_limits<T>::min();
    constexpr long highest = std::numeric_limits<T>::max();
    return static_cast<T>(std::clamp(value, lowest, highest));
}

// The value of what an unsigned scan read, `value` being negated modulo 2^64 when `negative`. The
// type's modulus is applied to magnitudes that it can hold; larger ones give 0 with a minus sign
// and the largest value without.
template <class T>
T limitUnsigned(unsigned long value, bool negative) {
    constexpr unsigned long highest = std::numeric_limits<T>::max();
    if (!negative) return static_cast<T>(std::min(value, highest));
    const unsigned long magnitude = 0 - value;
    return magnitude > highest ? T{0} : static_cast<T>(value);
}

}  // namespace detail

// How a numeric conversion reads its value. `status` is that of the stream's scan operations.

template <class T>
struct IntegerReadingFunctor {
    using Value = T;
    static constexpr FORMAT format = FORMAT::Integer;
    T operator()(stream& input, long width, int& status) const {
        return detail::saturateSigned<T>(input.scanInteger(width, status));
    }
};

template <class T>
struct IntegerCouldBeHexReadingFunctor {
    using Value = T;
    static constexpr FORMAT format = FORMAT::IntegerOrHex;
    T operator()(stream& input, long width, int& status) const {
        return detail::saturateSigned<T>(input.scanIntegerCouldBeHex(width, status));
    }
};

template <class T>
struct UnsignedIntegerReadingFunctor {
    using Value = T;
    static constexpr FORMAT format = FORMAT::Unsigned;
    T operator()(stream& input, long width, int& status) const {
        bool negative = false;
        const unsigned long value = input.scanUnsignedInteger(width, status, negative);
        return detail::limitUnsigned<T>(value, negative);
    }
};

template <class T>
struct HexReadingFunctor {
    using Value = T;
    static constexpr FORMAT format = FORMAT::Hex;
    T operator()(stream& input, long width, int& status) const {
        bool negative = false;
        const unsigned long value = input.scanHex(width, status, negative);
        return detail::limitUnsigned<T>(value, negative);
    }
};

template <class T>
struct OctalReadingFunctor {
    using Value = T;
    static constexpr FORMAT format = FORMAT::Octal;
    T operator()(stream& input, long width, int& status) const {
        bool negative = false;
        const unsigned long value = input.scanOctal(width, status, negative);
        return detail::limitUnsigned<T>(value, negative);
    }
};

// float: the double read, rounded once more (IEEE 754: beyond its range to infinity).
template <class T>
struct FloatReadingFunctor {
    using Value = T;
    static constexpr FORMAT format = FORMAT::Float;
    T operator()(stream& input, long width, int& status) const {
        return static_cast<T>(input.scanFloat(width, status));
    }
};

}  // namespace Orvandeil::FileIO
