#include "fileio/printf/printf_controller.h"

#include "embedded/services/messages.h"
#include "fileio/text/output_string_stream.h"
#include "tests/support/printing.h"

#include <cmath>
#include <limits>

#include <gtest/gtest.h>

using namespace Orvandeil::FileIO;
using namespace Orvandeil::FileIO::embedded;
using fileio_tests::print;
using foundation::core::except::IMsgIDException;

namespace {

const double inf = std::numeric_limits<double>::infinity();
const double nan = std::numeric_limits<double>::quiet_NaN();

// One argument of a row: a list of doubles as a row, or a text.
struct Value {
    Value(double number) : numbers{number} {}
    Value(std::initializer_list<double> list) : numbers(list) {}
    Value(const char* characters) : text(characters), isText(true) {}

    ArrayPtr array() const {
        if (isText) return makeChars(fileio_tests::toUtf16(text));
        return makeDoubles(numbers.empty() ? 0 : 1, numbers.size(),
                           std::span<const double>(numbers));
    }

    std::vector<double> numbers;
    std::string text;
    bool isText = false;
};

struct Row {
    int line;
    const char* format;
    std::vector<Value> arguments;
    const char* summary;  // the text, "!code" behind it for a failure
};

const Value empty = std::initializer_list<double>{};

const Row rows[] = {
    // Recycling, and where it stops.
    {__LINE__, "Total", {}, "Total"},
    {__LINE__, "Total", {1}, "Total!-9"},
    {__LINE__, "Total", {empty}, "Total!-9"},
    {__LINE__, "%d, %d;", {{1, 2, 3}}, "1, 2;3, !-13"},
    {__LINE__, "%d", {}, "!-13"},
    {__LINE__, "a%zb", {}, "a!-8"},
    {__LINE__, "%d %d %q", {1}, "1 !-13"},
    {__LINE__, "%d %d %q", {1, 2}, "1 2 !-8"},
    {__LINE__, "abc%", {1}, "abc!-8"},
    {__LINE__, "%d;", {{1, 2}, 3, {4, 5}}, "1;2;3;4;5;"},
    // An empty argument takes its turn.
    {__LINE__, "%d;", {1, empty}, "1;;"},
    {__LINE__, "%d;", {empty, 1}, ";1;"},
    {__LINE__,
     "%5d|%-5s|%5c|%5bx|%5f|",
     {empty, "", "", empty, empty},
     "     |     |     |     |     |"},
    {__LINE__, "%05d|%05s|", {empty, ""}, "00000|00000|"},
    {__LINE__, "%s", {empty}, ""},
    // Numbered arguments.
    {__LINE__, "%2$d %1$d", {1, 2}, "2 1"},
    {__LINE__, "%1$d;%1$d", {1, {2, 3}}, "1;1"},
    {__LINE__, "%3$d", {1, 2}, "!-44"},
    {__LINE__, "%3$s", {1, 2}, "!-44"},
    {__LINE__, "%1$d", {{1, 2}}, "!-43"},
    {__LINE__, "%1$5d", {empty}, "!-43"},
    {__LINE__, "%1$c", {"ab"}, "!-43"},
    {__LINE__, "%1$5s|%1$.1s", {"ab"}, "   ab|a"},
    {__LINE__, "%1$s", {{72, 105}}, "!-43"},
    {__LINE__, "%1$f", {{nan, nan}}, "!-43"},
    {__LINE__, "%1$*2$d|", {7, 4}, "   7|"},
    {__LINE__, "%1$*2$d|", {7, {4, 4}}, "!-43"},
    {__LINE__, "%1$.*3$f", {7, 4}, "!-44"},
    // Values that a conversion cannot hold; the next value starts afresh.
    {__LINE__, "%d ", {{2.5, 3}}, "2.500000e+00 3 "},
    {__LINE__, "%x ", {{-1, 255}}, "-1.000000e+00 ff "},
    {__LINE__, "%d", {9223372036854775808.0}, "9.223372e+18"},
    {__LINE__, "%u", {9223372036854775808.0}, "9223372036854775808"},
    {__LINE__, "%u", {18446744073709551616.0}, "1.844674e+19"},
    {__LINE__, "%x", {-0.0}, "0"},
    // Inf and NaN.
    {__LINE__, "%d %x %s %c %f", {nan, inf, -inf, inf, nan}, "NaN Inf -Inf Inf NaN"},
    {__LINE__, "%+f|% f|%+ f|%+f", {inf, inf, inf, nan}, "+Inf| Inf|+Inf|NaN"},
    {__LINE__, "%-6f|%06f|%.9f|%2f", {-inf, inf, nan, -inf}, "-Inf  |   Inf|NaN|-Inf"},
    {__LINE__, "%*f|", {-6, inf}, "+Inf  |"},
    // Width and precision from arguments.
    {__LINE__, "%*d|", {-6, 7}, "     7|"},
    {__LINE__, "%*s|", {-6, "ab"}, "ab    |"},
    {__LINE__, "%*c|", {-3, "a"}, "a  |"},
    {__LINE__, "%0*bx|", {-20, 1}, "3ff0000000000000    |"},
    {__LINE__, "%*d|", {-6, empty}, "      |"},
    {__LINE__, "%*d|", {2.9, 7}, " 7|"},
    {__LINE__, "%*d", {3e9, 7}, "!-18"},
    {__LINE__, "%*d", {nan, 7}, "!-15"},
    {__LINE__, "%*d", {-inf, 7}, "!-16"},
    {__LINE__, "%*d", {inf, 7}, "!-17"},
    {__LINE__, "%*d", {empty, 7}, "!-19"},
    {__LINE__, "%.*d", {-inf, 7}, "!-21"},
    {__LINE__, "%.*d", {inf, 7}, "!-22"},
    {__LINE__, "%.*d", {-3e9, 7}, "!-23"},
    {__LINE__, "%.*d", {empty, 7}, "!-24"},
    {__LINE__, "%*.*d", {empty, nan, 7}, "!-19"},
    {__LINE__, "%*d", {5}, "!-13"},
    {__LINE__, "%.*f|", {-1, 2, 1, 2}, "2.000000|2.0|"},
    {__LINE__, "%.*f|", {-0.5, 2}, "2|"},
    {__LINE__, "%.*d|", {-1, 2.5, 1, 2.5}, "2.500000e+00|2.5e+00|"},
    {__LINE__, "%.*s|%.*s|", {-1, "abc", 2, "abc"}, "abc|ab|"},
    {__LINE__, "%.*bx|", {-18, 1}, "3ff0000000000000|"},
    {__LINE__, "%*.*f|", {8, 2, 3.14159}, "    3.14|"},
    // Text.
    {__LINE__, "%d %s|", {"abc"}, "97 bc|"},
    {__LINE__, "%s|", {{72, 105, 3.5, 33}}, "Hi|3.500000e+00|!|"},
    {__LINE__, "%s|", {{72, nan, 33}}, "H|NaN|!|"},
    {__LINE__, "%s|", {{72, 105}, {33, 33}}, "Hi|!!|"},
    {__LINE__, "%.1s|", {{72, 105, 33}}, "H|"},
    {__LINE__, "%s|", {65536}, "6.553600e+04|"},
    {__LINE__, "%05s|%-05s|", {"ab", "ab"}, "000ab|ab000|"},
    {__LINE__, "%5.1s|%-5.1s|%.0s|", {"ab", "ab", "ab"}, "    a|a    ||"},
    {__LINE__, "%c%c", {"abc"}, "abc!-13"},
    {__LINE__, "%3c|%-3c|%03c|", {"abc"}, "  a|b  |00c|"},
    {__LINE__, "%c|%c", {65.5, -1}, "6.550000e+01|-1.000000e+00"},
};

TEST(PrintfController, PrintsAndFailsAsTold) {
    for (const Row& row : rows) {
        std::vector<ArrayPtr> arrays;
        std::vector<const vxArray*> list;
        for (const Value& value : row.arguments) {
            arrays.push_back(value.array());
            list.push_back(arrays.back().get());
        }
        EXPECT_EQ(print(row.format, list).summary(), row.summary) << "row of line " << row.line;
    }
}

TEST(PrintfController, TakesEveryClassAsItIs) {
    EXPECT_EQ(print("%d;", makeRow<std::int8_t>(vxINT8_CLASS, {-3, 4})).text, "-3;4;");
    EXPECT_EQ(print("%u;", makeRow<std::int8_t>(vxINT8_CLASS, {-3})).text, "-3.000000e+00;");
    EXPECT_EQ(print("%d%s", makeRow<std::uint8_t>(vxLOGICAL_CLASS, {1, 0})).text,
              std::string("1\0", 2));
    EXPECT_EQ(print("%f %d", makeRow<float>(vxSINGLE_CLASS, {0.1f, 16777216.0f})).text,
              "0.100000 16777216");
    EXPECT_EQ(print("%s", makeRow<std::int64_t>(vxINT64_CLASS, {65, 66, -1})).text,
              "AB-1.000000e+00");
    const ArrayPtr complex = makeNumeric(vxDOUBLE_CLASS, {1, 1}, vxCOMPLEX);
    *static_cast<double*>(realData(*complex)) = 5;
    EXPECT_EQ(print("%d", complex).text, "5");
    EXPECT_EQ(print("%d ", makeDoubles(2, 2, {1, 2, 3, 4})).text, "1 2 3 4 ");
    EXPECT_EQ(print("%d ", makeNumeric(vxINT16_CLASS, {1, 2, 3})).text, "0 0 0 0 0 0 ");
}

TEST(PrintfController, PrintsStringArraysElementByElement) {
    const ArrayPtr strings = makeStrings({u"ab", u"", u"cd"}, {1, 3});
    EXPECT_EQ(print("%s;", strings).text, "ab;;cd;");
    EXPECT_EQ(print("%4.1s|", strings).text, "   a|    |   c|");
    EXPECT_EQ(print("%f", makeString(u"2.5")).text, "2.500000");
    EXPECT_EQ(print("%5s|", makeStrings({}, {0, 0})).text, "|");  // not even the width
    EXPECT_EQ(print("%5d|", makeStrings({}, {0, 0})).text, "     |");
}

// An object of one element, of a class with this function besides; a null result: it does not
// apply.
ArrayPtr objectWith(const char* function, const ArrayPtr& result) {
    FunctionTable table = {{"size", [](auto) { return makeDoubles(1, 2, {1, 1}); }}};
    table[function] = [&result](auto) { return result ? copyOf(*result) : nullptr; };
    FunctionTable all = table;
    all.try_emplace("subsref", [table](auto) { return makeObject("thing", table); });
    return makeObject("thing", std::move(all));
}

// What printing comes to: the summary, or the identifier of the error raised.
std::string outcome(const char* format, const ArrayPtr& argument) {
    try {
        return print(format, argument).summary();
    } catch (const IMsgIDException& error) {
        return error.GetID();
    }
}

TEST(PrintfController, ConvertsObjectsAndNamesWhatTheyDoWrong) {
    const struct {
        int line;
        const char* format;
        const char* function;
        ArrayPtr result;
        const char* outcome;
    } objectRows[] = {
        {__LINE__, "%d", "size", nullptr, "KESTRA:printf:invalidSizeResult"},
        {__LINE__, "%d", "size", makeScalar(1), "KESTRA:printf:invalidSizeResult"},
        {__LINE__, "%d", "size", makeChars(u"ab"), "KESTRA:printf:invalidSizeResult"},
        {__LINE__, "%d", "size", makeDoubles(1, 0, {}), "KESTRA:printf:invalidSizeResult"},
        {__LINE__, "%3d|", "size", makeDoubles(1, 3, {1e13, 1e13, 0}), "   |"},
        {__LINE__, "%d", "subsref", nullptr, "KESTRA:UnableToConvert"},
        {__LINE__, "%d", "int64", makeScalar(1), "KESTRA:UnableToConvert"},
        {__LINE__, "%d", "int64", makeRow<std::int64_t>(vxINT64_CLASS, {5}), "5"},
        {__LINE__, "%f", "double", makeDoubles(1, 2, {1, 2}),
         "KESTRA:printf:UnableToConvertToOneElement"},
        {__LINE__, "%f", "double", makeScalar(nan), "nan"},  // past the test: the C library's text
        {__LINE__, "%c", "char", makeChars(u"ab"), "KESTRA:printf:UnableToConvertToOneElement"},
        {__LINE__, "%s", "char", makeChars(u"xy"), "xy"},
        {__LINE__, "%s", "double", makeScalar(1), "KESTRA:UnableToConvert"},
        {__LINE__, "%s", "string", makeString(u"z"), "z"},
        {__LINE__, "%s", "string", makeString({}), "KESTRA:string:MissingNotSupported"},
        {__LINE__, "%s", "string", makeStrings({u"a", u"b"}, {1, 2}),
         "KESTRA:string:MustBeStringScalarOrCharacterVector"},
    };
    for (const auto& row : objectRows) {
        EXPECT_EQ(outcome(row.format, objectWith(row.function, row.result)), row.outcome)
            << "row of line " << row.line;
    }
    EXPECT_EQ(outcome("%s", makeString({})), "KESTRA:string:MissingNotSupported");
    EXPECT_EQ(outcome("%c", makeString({})), "KESTRA:string:MissingNotSupported");
    EXPECT_EQ(outcome("%d", makeString(u"12")), "KESTRA:UnableToConvert");
}

// A stream of the caller's own sees each piece as a promise of size and one write, and every pad as
// a write of its own.
class WatchedStream : public outputStringStream {
public:
    WatchedStream() : outputStringStream("") {}

    void setBufferSize(unsigned long size) override {
        promised = size;
        outputStringStream::setBufferSize(size);
    }
    int print(const char* format, std::va_list arguments) override {
        const int length = outputStringStream::print(format, arguments);
        EXPECT_LE(static_cast<unsigned long>(length), promised);
        calls += "print " + std::to_string(length) + "; ";
        promised = 0;
        return length;
    }
    unsigned long PutNElements(unsigned long count, const void* source,
                               unsigned long elementSize) override {
        if (count > room) return 0;
        room -= count;
        calls += "put " + std::to_string(count) + "; ";
        return outputStringStream::PutNElements(count, source, elementSize);
    }

    std::string calls;
    unsigned long promised = 0;
    unsigned long room = 1000000;
};

TEST(PrintfController, ShowsEveryWriteToAForeignStream) {
    const ArrayPtr text = makeChars(u"ab");
    const ArrayPtr number = makeScalar(12);
    const vxArray* arguments[] = {text.get(), number.get()};
    WatchedStream out;
    EXPECT_TRUE(printfController(u"x=%4s%4d", &out, arguments, 2).doPrintf());
    EXPECT_EQ(out.calls, "put 2; put 1; put 1; put 2; put 4; print 4; ");
}

TEST(PrintfController, PromisesEnoughForEveryNumber) {
    const ArrayPtr largest = makeScalar(-std::numeric_limits<double>::max());
    const vxArray* argument[] = {largest.get()};
    for (const char* format : {"%f", "%400.99f", "%d", "%bo", "%#bx", "%-40tx", "%+.3e", "%5d"}) {
        WatchedStream out;
        EXPECT_TRUE(printfController(fileio_tests::toUtf16(format), &out, argument, 1).doPrintf());
    }
}

TEST(PrintfController, StopsAtTheFirstShortWrite) {
    const ArrayPtr numbers = makeDoubles(1, 3, {1, 22, 333});
    const vxArray* argument[] = {numbers.get()};
    WatchedStream out;
    out.room = 4;  // "1;22" and no more
    printfController controller(u"%d;", &out, argument, 1);
    EXPECT_FALSE(controller.doPrintf());
    EXPECT_EQ(controller.getErrorCode(), 0);  // a text in memory has no cause to tell
    EXPECT_EQ(out.calls, "put 1; print 1; put 1; put 2; print 2; ");
}

}  // namespace
