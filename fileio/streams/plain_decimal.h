#pragma once

#include "fileio/streams/field_text.h"

#include <charconv>
#include <cstdio>
#include <string_view>
#include <system_error>

namespace Orvandeil::FileIO::detail {

// Takes a number made of digits, a point and a complete exponent, at most `width` bytes (negative:
// no limit), exactly as C's fscanf takes it for "%le". Anything else, and what is long or out of
// range, is given back whole and left to that function.
class PlainDecimal {
public:
    PlainDecimal(std::FILE* file, long width) : field(file), room(width) {}

    bool take(double& value) {
        int byte = next();
        const bool isPlain = keepNumber(byte) && !tooLong;
        field.giveBack(byte);
        if (isPlain && convert(value)) return true;
        field.giveBackAll();
        return false;
    }

private:
    // What is behind the width, and behind what fits the buffer, is not read.
    int next() {
        tooLong = tooLong || field.isFull();
        if (room == 0 || tooLong) return EOF;
        if (room > 0) --room;
        return field.next();
    }

    void keep(int& byte) {
        field.keep(byte);
        byte = next();
    }

    void keepSign(int& byte) {
        if (byte == '+' || byte == '-') keep(byte);
    }

    bool keepDigits(int& byte) {
        const std::size_t before = field.size();
        while (byte >= '0' && byte <= '9')
            keep(byte);
        return field.size() != before;
    }

    // `byte` is the first one, and then the one behind the number.
    bool keepNumber(int& byte) {
        keepSign(byte);
        const std::size_t digitsStart = field.size();
        bool hasDigits = keepDigits(byte);
        if ((byte == 'x' || byte == 'X') && field.view().substr(digitsStart) == "0") return false;
        if (byte == '.') {
            keep(byte);
            hasDigits |= keepDigits(byte);
        }
        if (!hasDigits || (byte != 'e' && byte != 'E')) return hasDigits;
        keep(byte);
        keepSign(byte);
        return keepDigits(byte);
    }

    bool convert(double& value) const {
        std::string_view text = field.view();
        if (text.front() == '+') text.remove_prefix(1);
        double number = 0;
        const char* const end = text.data() + text.size();
        const auto [stop, error] = std::from_chars(text.data(), end, number);
        if (error != std::errc() || stop != end) return false;
        value = number;
        return true;
    }

    FieldText field;
    long room;
    bool tooLong = false;
};

}  // namespace Orvandeil::FileIO::detail
