#include "fileio/attributes/precision_string.h"

#include <charconv>
#include <cstring>
#include <limits>
#include <optional>
#include <string_view>

namespace Orvandeil::FileIO {
namespace {

// The machine formats with 64-bit longs.
constexpr int littleEndianLong64 = 5;
constexpr int bigEndianLong64 = 6;

constexpr unsigned long maxRepeatCount = std::numeric_limits<int>::max();
constexpr unsigned long maxFieldBits = 64;
// A wider field needs the integers of a format with 64-bit longs.
constexpr unsigned long maxPlainFieldBits = 32;

struct NamedType {
    std::string_view name;
    int code;
    bool needsLong64 = false;
};

constexpr NamedType namedTypes[] = {
    {"bool", dataType::Logical},
    {"logical", dataType::Logical},
    {"char", dataType::Char},
    {"char*1", dataType::Char},
    {"schar", dataType::Int8},
    {"signed char", dataType::Int8},
    {"short", dataType::Int16},
    {"int", dataType::Int32},
    {"long", dataType::Int32},
    {"float", dataType::Single},
    {"single", dataType::Single},
    {"double", dataType::Double},
    {"uchar", dataType::UInt8},
    {"unsigned char", dataType::UInt8},
    {"ushort", dataType::UInt16},
    {"unsigned short", dataType::UInt16},
    {"uint", dataType::UInt32},
    {"unsigned int", dataType::UInt32},
    {"ulong", dataType::UInt32},
    {"unsigned long", dataType::UInt32},
    {"noconvert", dataType::NoConversion},
    {"int8", dataType::Int8},
    {"int16", dataType::Int16},
    {"int32", dataType::Int32},
    {"int64", dataType::Int64, true},
    {"uint8", dataType::UInt8},
    {"uint16", dataType::UInt16},
    {"uint32", dataType::UInt32},
    {"uint64", dataType::UInt64, true},
    {"integer*1", dataType::Int8},
    {"integer*2", dataType::Int16},
    {"integer*4", dataType::Int32},
    {"integer*8", dataType::Int64},  // kept on purpose: does not need a format with 64-bit longs
    {"float32", dataType::Single},
    {"float64", dataType::Double},
    {"real*4", dataType::Single},
    {"real*8", dataType::Double},
};

struct FieldPrefix {
    std::string_view text;
    bool isSigned;
    void (*warn)();  // null: the proper spelling
};

template <class Id>
void warnOf() {
    vxWarningMsgId(Id());
}

constexpr FieldPrefix fieldPrefixes[] = {
    {"bit", true, nullptr},
    {"int", true, warnOf<KESTRA::FileIO::InvalidIntPrecision>},
    {"ubit", false, nullptr},
    {"uint", false, warnOf<KESTRA::FileIO::InvalidUIntPrecision>},
};

// A type as recognised, before a machine format is considered.
struct ParsedType {
    int code;
    int bits = 0;
    int containerBits = 0;  // of "NinM" its M, else 0
    bool needsLong64 = false;
};

// Takes a decimal number off the front; digits alone, no blanks and no sign. Nothing when there is
// no number, or none that `unsigned long` holds.
std::optional<unsigned long> takeNumber(std::string_view& text) {
    unsigned long number = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number);
    if (error != std::errc()) return std::nullopt;
    text.remove_prefix(static_cast<std::size_t>(end - text.data()));
    return number;
}

bool takeText(std::string_view& text, std::string_view expected) {
    if (!text.starts_with(expected)) return false;
    text.remove_prefix(expected.size());
    return true;
}

// White space of the C locale.
const char* skipBlanks(const char* text) {
    return text + std::strspn(text, " \t\n\v\f\r");
}

// The smallest integer type that holds `bits` bits.
int containerCode(unsigned long bits, bool isSigned) {
    const int step = bits <= 8 ? 0 : bits <= 16 ? 1 : bits <= 32 ? 2 : 3;
    return (isSigned ? dataType::Int8 : dataType::UInt8) + step;
}

std::optional<ParsedType> parseField(const FieldPrefix& prefix, std::string_view rest) {
    const auto bits = takeNumber(rest);
    if (!bits || *bits < 1) return std::nullopt;
    std::optional<unsigned long> container;
    if (!rest.empty()) {
        if (!takeText(rest, "in")) return std::nullopt;
        container = takeNumber(rest);
        if (!container || !rest.empty()) return std::nullopt;
    }
    const unsigned long room = container.value_or(maxFieldBits);
    if (room > maxFieldBits || *bits > room) return std::nullopt;
    if (!container && prefix.warn != nullptr) prefix.warn();
    return ParsedType{containerCode(container.value_or(*bits), prefix.isSigned),
                      static_cast<int>(*bits), static_cast<int>(container.value_or(0)),
                      *bits > maxPlainFieldBits};
}

std::optional<ParsedType> parseType(std::string_view text) {
    for (const NamedType& type : namedTypes) {
        if (text == type.name) return ParsedType{type.code, 0, 0, type.needsLong64};
    }
    for (const FieldPrefix& prefix : fieldPrefixes) {
        if (text.starts_with(prefix.text)) {
            return parseField(prefix, text.substr(prefix.text.size()));
        }
    }
    return std::nullopt;
}

int withLong64(int machineFormat) {
    if (machineFormat == littleEndianLong64 || machineFormat == bigEndianLong64) {
        return machineFormat;
    }
    return vxDataSizeEndian(machineFormat) == 1 ? bigEndianLong64 : littleEndianLong64;
}

int sizeInFile(const ParsedType& parsed, int givenFormat, int machineFormat) {
    if (parsed.bits != 0) return parsed.containerBits;
    if (parsed.code == dataType::NoConversion) return 0;
    const bool isNative = machineFormat == vxDataSizeNative() && machineFormat == givenFormat;
    return isNative ? 0 : vxDataSizeConverted(machineFormat, parsed.code);
}

// Which targets a conversion may have: double always, other types by their width.
bool isTarget(int code, int bits, int size) {
    if (code == dataType::Double) return true;
    if (bits == 0) return size <= 2 || size == 4 || size == 8;
    const bool isWhole = bits == 8 || bits == 16 || bits == 32 || bits == 64;
    return isWhole && (size == 0 || size == bits / 8);
}

}  // namespace

const char* fiPvParsePrecisionType(const char* text, int* machineFormat, int* type, int* bitCount,
                                   int* size) {
    const std::string_view given(text, std::strcspn(text, "="));
    const auto parsed = parseType(given);
    if (!parsed) return nullptr;
    const int givenFormat = *machineFormat;
    if (parsed->needsLong64) *machineFormat = withLong64(givenFormat);
    *type = parsed->code;
    *bitCount = parsed->bits;
    *size = sizeInFile(*parsed, givenFormat, *machineFormat);
    return text + given.size();
}

PrecisionString::PrecisionString() = default;

PrecisionString::PrecisionString(int type)
    : outputType(dataType::UInt8), inputType(type), allowConversion(false) {}

PrecisionString::PrecisionString(const char* precision) {
    valid = PrecisionString::Init(precision);
}

PrecisionString& PrecisionString::operator=(const PrecisionString& other) {
    outputType = other.outputType;
    machineFormat = other.machineFormat;
    repeatCount = other.repeatCount;
    convertedSize = other.convertedSize;
    inputType = other.inputType;
    bitCount = other.bitCount;
    allowConversion = other.allowConversion;
    return *this;
}

PrecisionString& PrecisionString::operator=(const char* precision) {
    CharAttrValidator::operator=(precision);
    return *this;
}

bool PrecisionString::Init(const char* precision) {
    text = precision;
    repeatCount = 1;
    std::string_view rest = text;
    const bool shorthand = takeText(rest, "*");
    // No type begins with a digit: a number without its '*', or behind a '*', fails as a type.
    if (const auto number = shorthand ? std::nullopt : takeNumber(rest)) {
        if (!takeText(rest, "*") || *number < 1 || *number > maxRepeatCount) return false;
        repeatCount = *number;
    }
    const bool hasPrefix = rest.size() < text.size();
    const char* type = hasPrefix ? skipBlanks(rest.data()) : rest.data();
    return allowConversion ? initSource(type, shorthand) : initFileType(type);
}

bool PrecisionString::initFileType(const char* rest) {
    const char* end =
        fiPvParsePrecisionType(rest, &machineFormat, &outputType, &bitCount, &convertedSize);
    if (end == nullptr || *end != '\0') return false;
    // The values' own type is then the file's; it has to have one.
    const bool hasOwnType = inputType >= dataType::Logical && inputType <= dataType::Double;
    return outputType != dataType::NoConversion || hasOwnType;
}

bool PrecisionString::initSource(const char* rest, bool shorthand) {
    const char* end =
        fiPvParsePrecisionType(rest, &machineFormat, &inputType, &bitCount, &convertedSize);
    if (end == nullptr || inputType == dataType::NoConversion) return false;
    if (*end == '\0') {
        outputType = shorthand ? inputType : dataType::Double;
        return true;
    }
    if (shorthand || std::strncmp(end, "=>", 2) != 0) return false;
    return initTarget(skipBlanks(end + 2));
}

bool PrecisionString::initTarget(const char* rest) {
    int type = 0;
    int bits = 0;
    int size = 0;
    const char* end = fiPvParsePrecisionType(rest, &machineFormat, &type, &bits, &size);
    // Kept on purpose: a target that is none leaves the output type alone and is no error.
    if (end == nullptr || *end != '\0') return true;
    outputType = type;
    return isTarget(type, bits, size);
}

}  // namespace Orvandeil::FileIO
