#include "fileio/errors/code_list.h"
#include "fileio/streams/decimal_field.h"
#include "fileio/streams/field_text.h"
#include "fileio/streams/file_stream.h"
#include "fileio/streams/scan_operation.h"

#include <algorithm>
#include <bit>
#include <cerrno>
#include <climits>
#include <cstdint>
#include <limits>

namespace Orvandeil::FileIO {
namespace {

using detail::FieldText;
using detail::IntegerField;
using detail::IntegerScan;

constexpr int hexBase = 16;

bool isDigit(int base, int byte) {
    if (byte >= '0' && byte <= '9') return byte - '0' < base;
    const int lower = byte | 0x20;
    return base == hexBase && lower >= 'a' && lower <= 'f';
}

// Gathers the characters of one integer field that count towards its value and reads past those
// that do not.
class IntegerCollector {
public:
    IntegerCollector(std::FILE* file, const IntegerScan& scanOperation, long fieldWidth)
        : field(file), operation(scanOperation), width(fieldWidth), base(scanOperation.base) {}

    // False when there is no number: all but the blanks is given back.
    bool collect() {
        keepPrefix();
        const auto prefix = static_cast<long>(field.size());
        const long room = width < 0 ? countedDigits : std::min(width, countedCharacters) - prefix;
        if (room < 0 || (room == 0 && !leadingZero)) return giveUp();
        long surplus = width < 0 ? LONG_MAX : std::max(width - countedCharacters, 0L);
        if (skipsZeros()) surplus -= readPast(zeroBase, surplus);
        const long digits = keepDigits(room);
        if (digits == 0 && !leadingZero) return giveUp();
        if (digits == room) readPast(base, surplus);
        return true;
    }

    IntegerField parse() const {
        IntegerField result = detail::parseInteger(field.view(), operation);
        result.negative = negative;
        return result;
    }

private:
    static constexpr long countedDigits = 22;      // without a width
    static constexpr long countedCharacters = 24;  // with one
    static constexpr int zeroBase = 1;             // in which 0 is the only digit

    // Sign, one leading zero and the "x" behind it.
    void keepPrefix() {
        int byte = field.nextBehindBlanks();
        negative = byte == '-';
        if (byte == '-' || byte == '+') {
            field.keep(byte);
            byte = field.next();
        }
        leadingZero = byte == '0';
        if (leadingZero) {
            field.keep(byte);
            keepBasePrefix();
        } else {
            field.giveBack(byte);
            if (base == 0) base = 10;
        }
    }

    void keepBasePrefix() {
        if (base != 0 && base != hexBase) return;
        const int byte = field.next();
        hexPrefix = byte == 'x' || byte == 'X';
        if (hexPrefix) {
            field.keep(byte);
        } else {
            field.giveBack(byte);
        }
        if (base == 0) base = hexPrefix ? hexBase : 8;
    }

    // The zeros behind the "0x" of a field that can only be hexadecimal do count; this is on
    // purpose.
    bool skipsZeros() const { return leadingZero && !(hexPrefix && operation.base == hexBase); }

    // Reads past at most `most` digits and returns their number.
    long readPast(int digitBase, long most) {
        for (long count = 0; count < most; ++count) {
            const int byte = field.next();
            if (isDigit(digitBase, byte)) continue;
            field.giveBack(byte);
            return count;
        }
        return most;
    }

    long keepDigits(long most) {
        for (long count = 0; count < most; ++count) {
            const int byte = field.next();
            if (isDigit(base, byte)) {
                field.keep(byte);
                continue;
            }
            field.giveBack(byte);
            return count;
        }
        return most;
    }

    bool giveUp() {
        field.giveBackAll();
        return false;
    }

    FieldText field;
    const IntegerScan& operation;
    long width;
    int base;
    bool negative = false;
    bool leadingZero = false;
    bool hexPrefix = false;
};

constexpr int untouched = INT_MAX;

// The beginning of a floating field: the sign alone, or all of an infinity or NaN.
class FloatStart {
public:
    enum Kind { Number, Infinity, NotANumber, NearMiss };

    // Everything read is given back, except the text of an infinity or NaN.
    explicit FloatStart(std::FILE* file) : field(file) {
        int byte = field.nextBehindBlanks();
        if (byte == '-' || byte == '+') {
            sign = byte;
            field.keep(byte);
            byte = field.next();
        }
        if (byte == 'i' || byte == 'I') {
            kind = keepWord(byte, "nNfF") ? Infinity : NearMiss;
        } else if (byte == 'n' || byte == 'N') {
            kind = keepWord(byte, "aAnN") ? NotANumber : NearMiss;
        } else {
            field.giveBack(byte);
        }
        if (kind == Number || kind == NearMiss) giveBack();
    }

    Kind getKind() const { return kind; }
    int getSign() const { return sign; }
    bool isNonFinite() const { return kind == Infinity || kind == NotANumber; }
    void giveBack() { field.giveBackAll(); }

    // A minus sign does not show in a NaN.
    double nonFiniteValue() const {
        if (kind == NotANumber) return std::bit_cast<double>(std::uint64_t{0xFFF8000000000000});
        constexpr double infinity = std::numeric_limits<double>::infinity();
        return sign == '-' ? -infinity : infinity;
    }

private:
    // `rest` holds the two letters behind the first one, each in both cases.
    bool keepWord(int first, const char* rest) {
        field.keep(first);
        for (const char* letter = rest; *letter != 0; letter += 2) {
            const int byte = field.next();
            if (byte != letter[0] && byte != letter[1]) {
                field.giveBack(byte);
                return false;
            }
            field.keep(byte);
        }
        return true;
    }

    FieldText field;
    Kind kind = Number;
    int sign = 0;  // 0: none
};

bool scanByLibrary(std::FILE* file, long width, double& value) {
    if (width < 0) return std::fscanf(file, "%le", &value) == 1;
    char format[32];
    std::snprintf(format, sizeof format, "%%%dle",
                  static_cast<int>(std::min<long>(width, INT_MAX)));
    return std::fscanf(file, format, &value) == 1;
}

#ifdef FILEIO_FAST_PATHS
// Takes the next number where it lies read ahead of the file, and the byte behind it too, unless
// the width ends there.
template <class Number>
bool takeAhead(std::FILE* file, long width, bool (*take)(detail::FieldBytes&, Number&),
               Number& number) {
    const std::string_view ahead = detail::bytesReadAhead(file);
    detail::FieldBytes bytes = {ahead.data(), ahead.data() + ahead.size(), false};
    bytes.skip(detail::isCBlank);
    bytes.cutTo(width);
    if (!take(bytes, number)) return false;
    detail::takeReadAhead(file, bytes.next);
    return true;
}
#endif

}  // namespace

// What a Rewind gives back must not be a byte that was read before the field.
void fileStream::beginScan() {
    errno = 0;
    lastByteRead = 0;
    recentBytes.clear();
}

void fileStream::takeScanned(const char* next) {
    beginScan();
    detail::takeReadAhead(file, next);
}

IntegerField fileStream::scanField(const IntegerScan& operation, long width, int& status) {
    beginScan();
#ifdef FILEIO_FAST_PATHS
    detail::DecimalInteger number;
    if (operation.base == 10 && takeAhead(file, width, detail::takeInteger, number))
        return {.consumed = 1, .magnitude = number.magnitude, .negative = number.negative};
#endif
    IntegerCollector collector(file, operation, width);
    if (!collector.collect()) {
        recordFailure();
        status = errorCode;
    }
    return collector.parse();
}

unsigned long fileStream::scanOctal(long width, int& status, bool& flag) {
    return scanField(detail::scan::octal, width, status).asFlagged(flag);
}

// Unlike the other unsigned scans, this one tells the sign of any field, and keeps what is out of
// range at the largest value; this is on purpose.
unsigned long fileStream::scanHex(long width, int& status, bool& flag) {
    const IntegerField field = scanField(detail::scan::hex, width, status);
    flag = field.negative;
    return field.asUnsigned();
}

unsigned long fileStream::scanUnsignedInteger(long width, int& status, bool& flag) {
    return scanField(detail::scan::unsignedInteger, width, status).asFlagged(flag);
}

long fileStream::scanInteger(long width, int& status) {
    return scanField(detail::scan::integer, width, status).asSigned();
}

long fileStream::scanIntegerCouldBeHex(long width, int& status) {
    return scanField(detail::scan::integerCouldBeHex, width, status).asSigned();
}

double fileStream::scanFloat(long width, int& status) {
    beginScan();
#ifdef FILEIO_FAST_PATHS
    if (double value = 0; takeAhead(file, width, detail::takeReal, value)) {
        status = untouched;
        return value;
    }
#endif
    FloatStart start(file);
    if (start.isNonFinite()) {
        if (status == untouched) return start.nonFiniteValue();
        start.giveBack();
        if (status != 0) return -1.0;
    } else if (start.getKind() == FloatStart::NearMiss) {
        status = code::NoHelp;
        return -1.0;
    }
    return scanNumber(width, start.getSign(), status);
}

// Of a field that holds no number, the sign is given back even where it is not the last byte read;
// this is on purpose.
double fileStream::scanNumber(long width, int sign, int& status) {
    status = untouched;
    double value = 0;
    if (width != 0) {
        errno = 0;
        if (scanByLibrary(file, width, value)) return value;
        if (sign != 0) std::ungetc(sign, file);
    }
    recordFailure();
    status = errorCode;
    return 0;
}

}  // namespace Orvandeil::FileIO
