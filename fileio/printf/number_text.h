#pragma once

#include "fileio/printf/vocabulary.h"

#include <cstddef>

// Numbers as the C library's printf writes them, for the fields of a conversion that does not take
// width or precision from arguments.
namespace Orvandeil::FileIO::detail {

struct NumberForm {
    char conversion;    // one of d u o x X e E f g G; an i becomes d
    bool leftJustify;   // -
    bool zeroFill;      // 0, where it counts
    bool alternate;     // #
    char positiveSign;  // '+', ' ' or none (0)
    bool bare;          // a whole number's letter and nothing else
    int width;
    int precision;          // negative: none (whole numbers only)
    double plainLimit;      // magnitudes from here on are left to the standard library
    std::size_t mostBytes;  // what one number takes at most, room for writing ahead included
};

// The form of a conversion. Integers of o u x X have no sign.
NumberForm makeNumberForm(char conversion, PrintFormatFlags flags, int width, bool hasPrecision,
                          int precision);

// Whether the writers below know the form.
bool isKnownForm(const NumberForm& form);

// The largest width or precision of such a form, and the most that one of them takes.
inline constexpr int largestField = 128;
inline constexpr std::size_t largestNumberBytes = 640;

// Whether printf rounds and points now as the writers do: to nearest, with '.'.
bool writesAsPrintf();

// Each writes one number and returns its end; the room is the form's mostBytes.
char* writeSigned(char* out, const NumberForm& form, long value);
char* writeUnsigned(char* out, const NumberForm& form, unsigned long value);
char* writeReal(char* out, const NumberForm& form, double value);  // finite
inline char* writeNumber(char* out, const NumberForm& form, long value) {
    return writeSigned(out, form, value);
}
inline char* writeNumber(char* out, const NumberForm& form, unsigned long value) {
    return writeUnsigned(out, form, value);
}
inline char* writeNumber(char* out, const NumberForm& form, double value) {
    return writeReal(out, form, value);
}
// "NaN", "Inf" or "-Inf", padded with blanks whatever the form fills with.
char* writeNonFinite(char* out, const NumberForm& form, double value);

}  // namespace Orvandeil::FileIO::detail
