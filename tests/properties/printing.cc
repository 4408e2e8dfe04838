#include "tests/support/printing.h"

#include "embedded/services/element_types.h"
#include "embedded/services/memory.h"
#include "fileio/host/memory.h"
#include "fileio/printf/printf_controller.h"
#include "fileio/text/output_string_stream.h"
#include "tests/properties/properties.h"
#include "tests/support/raised.h"
#include "tests/support/test_files.h"

#include <bit>
#include <cctype>
#include <cerrno>
#include <cmath>
#include <cstdio>
#include <cstring>
#include <optional>
#include <random>
#include <type_traits>

// The C library's printf is the referee for whatever a number looks like. A stream of a class that
// the library does not know is written to in the plainest way: it is the referee for all the rest.

namespace properties {
namespace {

using namespace Orvandeil::FileIO;
using namespace Orvandeil::FileIO::embedded;
using Arguments = std::vector<const vxArray*>;
using support::Unknown;

constexpr vxClassID classes[] = {vxDOUBLE_CLASS, vxDOUBLE_CLASS, vxSINGLE_CLASS, vxINT8_CLASS,
                                 vxINT16_CLASS,  vxINT32_CLASS,  vxINT64_CLASS,  vxUINT8_CLASS,
                                 vxUINT16_CLASS, vxUINT32_CLASS, vxUINT64_CLASS, vxCHAR_CLASS,
                                 vxLOGICAL_CLASS};

// One or two rows of up to 40 elements.
ArrayPtr anyNumbers(Bytes& input, vxClassID classID) {
    const std::size_t columns = input.below(input.below(4) == 0 ? 40 : 5);
    ArrayPtr array = makeNumeric(classID, {1 + input.below(8) / 7, columns});
    const auto fill = [&]<class T>(ElementType<T>) {
        for (std::size_t i = 0; i < elementCount(*array); ++i) {
            T& element = static_cast<T*>(realData(*array))[i];
            if constexpr (std::is_floating_point_v<T>)
                element = static_cast<T>(input.real());
            else
                element = static_cast<T>(classID == vxLOGICAL_CLASS
                                             ? input.below(2)
                                             : input.number(1 + input.below(2) * (sizeof(T) - 1)));
        }
    };
    withElementType(classID, fill, [] {});
    return array;
}

template <class... Values>
std::string formatted(const std::string& format, Values... values) {
    char text[1024];
    std::snprintf(text, sizeof text, format.c_str(), values...);
    return text;
}

std::string nonFinite(const std::string& start, int width, double value) {
    const auto has = [&](char flag) { return start.find(flag) != start.npos; };
    const char* const positive = has('+') ? "+Inf" : has(' ') ? " Inf" : "Inf";
    return formatted("%*s", has('-') ? -width : width,
                     std::isnan(value) ? "NaN"
                     : value < 0       ? "-Inf"
                                       : positive);
}

// What a conversion cannot hold is shown in the exponent form of the same flags.
template <class T>
std::string expectedNumber(const std::string& start, char conversion, int width, T value) {
    const auto exact = static_cast<long double>(value);
    const bool isWhole = std::trunc(exact) == exact;
    const bool isSigned = conversion == 'd' || conversion == 'i';
    if (!std::isfinite(exact)) return nonFinite(start, width, static_cast<double>(value));
    if (std::strchr("eEfgG", conversion))
        return formatted(start + conversion, static_cast<double>(value));
    if (isSigned && isWhole && exact >= -0x1p63L && exact < 0x1p63L)
        return formatted(start + "ll" + conversion, static_cast<long long>(value));
    if (!isSigned && isWhole && exact >= 0 && exact < 0x1p64L)
        return formatted(start + "ll" + conversion, static_cast<unsigned long long>(value));
    return formatted(start + "e", static_cast<double>(value));
}

// Any flags, width and precision, to be followed by a conversion.
std::string anyStart(Bytes& input, std::size_t width) {
    std::string start = "%";
    const std::size_t flags = input.below(3) == 0 ? input.below(32) : 0;
    for (std::size_t i = 0; i < 5; ++i) {
        if (flags >> i & 1) start += "-+ #0"[i];
    }
    if (width != 0) start += std::to_string(width);
    if (input.below(2) == 0) start += '.' + std::to_string(input.below(30));
    return start;
}

// The elements of an array, each through one conversion between literals.
void compareWithC(Bytes& input, const ArrayPtr& array, const std::string& before,
                  const std::string& start, int width, char conversion, const std::string& after) {
    std::string wanted;
    const auto append = [&]<class T>(ElementType<T>) {
        for (std::size_t i = 0; i < elementCount(*array); ++i) {
            const T value = static_cast<const T*>(vxArrayData(array.get()))[i];
            wanted += before + expectedNumber(start, conversion, width, value) + after;
        }
    };
    withElementType(vxArrayClassID(array.get()), append, [] {});
    const std::string format = before + start + conversion + after;
    const std::string text = fileio_tests::print(format, array).summary();
    if (!wanted.empty()) requireEqual(text, wanted, format);
    input.observe(text);
}

// Values that are hard in their own ways: any bits, few decimals, halves, decimal halves,
// neighbours of powers of ten, whole numbers, singles; about as long as a word of digits.
double hardNumber(std::size_t kind, std::mt19937_64& random) {
    const auto power = [&](unsigned count) { return std::pow(10, random() % count); };
    switch (kind) {
        case 0:
            return std::bit_cast<double>(random());
        case 1:
            return (static_cast<double>(random() % 20000001) - 10000000) / power(9);
        case 2:
            return std::ldexp(random() >> (11 + random() % 53),
                              static_cast<int>(random() % 120) - 80);
        case 3:
            return (static_cast<double>(random() >> (20 + random() % 40)) * 10 + 5) * power(6);
        case 4:
            return std::nextafter(std::pow(10, static_cast<int>(random() % 632) - 323),
                                  random() % 2 == 0 ? 0 : INFINITY);
        case 5:
            return static_cast<double>(static_cast<long>(random()) >> random() % 64);
        case 6:
            return std::bit_cast<float>(static_cast<std::uint32_t>(random()));
        case 7:
            return static_cast<int>(random()) / 21;
        default:
            return static_cast<double>(random() >> (31 + random() % 33));
    }
}

void againstC(Bytes& input) {
    static const std::string around[] = {"", " ", ",", "\n", "x = ", "é"};
    const std::size_t width = input.below(3) == 0 ? input.below(40) : 0;
    const std::string start = anyStart(input, width);
    const char conversion = input.of(std::string_view("diouxXeEfgG"));
    const std::string before = input.of(around), after = input.of(around);
    const ArrayPtr array = anyNumbers(input, input.of(classes));
    compareWithC(input, array, before, start, static_cast<int>(width), conversion, after);
    if (input.empty()) return;
    const ArrayPtr hard = makeNumeric(vxDOUBLE_CLASS, {1, 50});
    const std::size_t kind = input.below(9);
    std::mt19937_64 random(input.number(8));
    for (std::size_t i = 0; i < 50; ++i)
        static_cast<double*>(realData(*hard))[i] = hardNumber(kind, random);
    if (kind >= 7) {
        return compareWithC(input, hard, "", "%", 0, input.of(std::string_view("duxX")), after);
    }
    const std::string precision = "%." + std::to_string(input.below(18));
    compareWithC(input, hard, "", precision, 0, input.of(std::string_view("efg")), "\n");
}

// What shows of a call but its text.
std::string print(TcodnStream& out, const std::u16string& format, Arguments arguments) {
    std::string seen;
    const std::string early = fileio_tests::raisedBy([&] {
        printfController controller(format, &out, arguments.data(),
                                    static_cast<int>(arguments.size()));
        bool complete = false;
        const std::string raised =
            fileio_tests::raisedBy([&] { complete = controller.doPrintf(); });
        const foutFormatPiece* const piece = controller.getCurrentPiece();
        seen = " complete " + std::to_string(complete) + " code " +
               std::to_string(controller.getErrorCode()) + ' ' + raised + " at " +
               std::to_string(piece == nullptr ? 0 : piece->getFormatPosition());
    });
    return early + seen + " error " + std::to_string(out.getErrorCode());
}

// From a given call on (0 is never), an allocation fails once, or all writes do.
struct Failures {
    std::size_t allocation = 0;
    int write = 0, error = 0;
    std::size_t bufferSize = 64;
};

template <class Stream>
std::string printToString(const std::string& encoding, const std::u16string& format,
                          const Arguments& arguments, const Failures& failures = {}) {
    Stream out(encoding);
    std::string end;
    {
        std::optional<FailingAllocation> failing;
        if (failures.allocation != 0) failing.emplace(failures.allocation);
        end = print(out, format, arguments) + (failing && failing->happened() ? " failed" : "");
    }
    return fileio_tests::taken(out) + end;
}

template <class Stream>
std::string printToFile(const std::string& encoding, const std::u16string& format,
                        const Arguments& arguments, const Failures& failures = {}) {
    support::FaultyFile memory{
        .bytes = "", .failingWrite = failures.write, .error = failures.error};
    std::string end;
    {
        support::StreamOver<Stream> out(memory.open("w", failures.bufferSize), "w", encoding);
        end = print(out.stream, format, arguments) + " wrote " +
              std::to_string(out.stream.getBytesWritten());
    }
    return memory.bytes + end;
}

ArrayPtr anyArgument(Bytes& input, bool areWidths) {
    static const std::string parts[] = {"a", "é", "€", "\xF0\x9F\x98\x80", "%d", ""};
    const std::size_t kind = areWidths ? 2 : input.below(5);
    if (kind == 0) return makeChars(fileio_tests::toUtf16(input.text(parts, 30)));
    if (kind == 1) return makeStrings({fileio_tests::toUtf16(input.text(parts, 9)), u"b"}, {1, 2});
    if (!areWidths) return anyNumbers(input, input.of(classes));
    ArrayPtr array = anyNumbers(input, vxDOUBLE_CLASS);
    for (std::size_t i = 0; i < elementCount(*array); ++i) {
        double& width = static_cast<double*>(realData(*array))[i];
        if (std::abs(width) > 99 && std::abs(width) < 0x1p31) width = 70;
    }
    return array;
}

// Widths of many digits would only make long texts.
bool hasLongNumber(const std::string& format) {
    std::size_t digits = 0;
    for (const char letter : format) {
        digits = std::isdigit(static_cast<unsigned char>(letter)) ? digits + 1 : 0;
        if (digits > 2) return true;
    }
    return false;
}

ArrayPtr tiled(ArrayPtr array, std::size_t times) {
    const vxClassID classID = vxArrayClassID(array.get());
    const std::size_t count = elementCount(*array), bytes = count * elementBytes(classID);
    if (bytes == 0) return array;
    ArrayPtr result = makeNumeric(classID, {1, count * times});
    for (std::size_t i = 0; i < times; ++i)
        std::memcpy(static_cast<char*>(realData(*result)) + i * bytes, realData(*array), bytes);
    return result;
}

// The arguments over and over: many are printed in another way than few.
Arguments listed(const std::vector<ArrayPtr>& owned, std::size_t times) {
    Arguments arguments;
    while (times-- > 0) {
        for (const ArrayPtr& argument : owned)
            arguments.push_back(argument.get());
    }
    return arguments;
}

// How much padding of text stands before a failure depends on the stream: known ones take it in
// blocks.
[[maybe_unused]] std::string withoutPads(std::string text) {
    std::erase_if(text, [](char letter) { return letter == ' ' || letter == '0' || letter == 0; });
    return text;
}

// More of the same, with memory or a disk that comes to its end.
void withFailures(Bytes& input, std::string text, const std::string& encoding,
                  std::vector<ArrayPtr>& owned) {
    static const std::size_t bufferSizes[] = {4096, 4100, 8192};
    static const std::string plain[] = {"%d", "%d,", "%u;%x ", "%g|%i\n", "%c", "%s\n"};
    if (input.below(2) == 0) text = input.of(plain);
    const std::size_t times = 1 + input.below(200);
    if (text.size() % 2 == 0) {
        for (ArrayPtr& argument : owned)
            argument = tiled(std::move(argument), times);
    }
    const Arguments arguments = listed(owned, text.size() % 2 == 0 ? 1 : times);
    Failures failures = {.allocation = input.below(input.below(4) == 0 ? 60 : 5),
                         .bufferSize = input.of(bufferSizes)};
    const std::u16string format =
        fileio_tests::toUtf16(text + std::string(input.below(4) == 0 ? input.below(400) : 0, '*'));
#ifndef FILEIO_SMALL_CONSTANTS  // which cut numbers into pieces, of which some may find memory
    const auto printed = [&]<class Stream>(std::type_identity<Stream>) {
        return withoutPads(printToString<Stream>(encoding, format, arguments, failures));
    };
    requireEqual(printed(std::type_identity<outputStringStream>()),
                 printed(std::type_identity<Unknown<outputStringStream>>()),
                 text + " with failing memory");
#endif
    // Of a block of padding, a failing file counts all or nothing.
    if (text.find_first_of("sc") == text.npos) failures.write = static_cast<int>(input.below(6));
    failures.error = failures.write % 2 == 0 ? ENOSPC : 0;
    requireEqual(printToFile<fileStream>(encoding, format, arguments, failures),
                 printToFile<Unknown<fileStream>>(encoding, format, arguments, failures),
                 text + " to a full disk");
}

void againstUnknownStreams(Bytes& input) {
    static const std::vector<std::string> parts = split(
        "%d|%f|%g|%s|%c|%5.3e|%x|%bx|%to|%-|%0|%+|%.|%*d|%.*f|%1$d|%2$s|*1$|%ld|%%|%|, |\n|é|€|"
        "\xF0\x9F\x98\x80|$|%-8.3f|%12d|%i|%u");
    static const char* const encodings[] = {"",       "",          "UTF-8", "ISO-8859-1",
                                            "UTF-16", "Shift_JIS", "UTF-7", "UTF-32BE"};
    const std::string text = input.text(parts, 20), encoding = input.of(encodings);
    if (hasLongNumber(text)) return;
    const bool areWidths = text.find('*') != text.npos;
    std::vector<ArrayPtr> owned(input.below(4));
    for (ArrayPtr& argument : owned)
        argument = anyArgument(input, areWidths);
    const Arguments arguments = listed(owned, text.size() % 3 == 0 ? 9 : 1);
    const std::u16string format = fileio_tests::toUtf16(text);
    const std::string seen = printToString<outputStringStream>(encoding, format, arguments);
    requireEqual(seen, printToString<Unknown<outputStringStream>>(encoding, format, arguments),
                 text);
    input.observe(seen);
    if (!encoding.empty())
        requireEqual(printToFile<fileStream>(encoding, format, arguments),
                     printToFile<Unknown<fileStream>>(encoding, format, arguments),
                     text + " to a file");
    if (!input.empty()) withFailures(input, text, encoding, owned);
}

}  // namespace

void printing(Bytes& input) {
    if (input.below(2) == 0) return againstC(input);
    againstUnknownStreams(input);
}

}  // namespace properties
