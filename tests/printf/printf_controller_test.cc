#include "fileio/printf/printf_controller.h"

#include "embedded/services/array.h"
#include "fileio/printf/printf_argument_source.h"
#include "fileio/text/output_string_stream.h"
#include "tests/support/printing.h"

#include <array>
#include <cstdio>
#include <limits>

#include <gtest/gtest.h>

namespace {

using namespace Orvandeil::FileIO;
using namespace Orvandeil::FileIO::embedded;
using fileio_tests::print;
using foundation::core::except::IMsgIDException;

const double nan = std::numeric_limits<double>::quiet_NaN();

TEST(PrintfController, PrintsArraysElementByElement) {
    EXPECT_EQ(print("%d ", makeNumeric(vxINT16_CLASS, {1, 2, 3})).text, "0 0 0 0 0 0 ");
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

// Beyond the digits that any double has, with all flags and with widths about the length.
TEST(PrintfController, PrintsLongPrecisionsAsTheCLibraryDoes) {
    std::string text(4096, '\0');
    for (std::size_t code = 0; code < 32 * 3 * 4 * 5; ++code) {
        std::string format = "%";
        for (std::size_t i = 0; i < 5; ++i)
            format += code >> i & 1 ? std::string(1, "-+ #0"[i]) : "";
        const std::size_t rest = code / 32;
        format += std::array{"", "1104", "2000"}[rest % 3];
        format += std::array{".1099", ".1100", ".1101", ".1500"}[rest / 3 % 4];
        format += "eEfgG"[rest / 12];
        for (const double value : {0.1, -2.5e300, 5e-324, 0.0, 1e22}) {
            const int length = std::snprintf(text.data(), text.size(), format.c_str(), value);
            EXPECT_EQ(print(format, makeScalar(value)).text,
                      text.substr(0, static_cast<std::size_t>(length)))
                << format;
        }
    }
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

std::vector<double> walkRow(printfMatrixArgumentSource& source) {
    std::vector<double> row;
    while (source.hasMoreData())
        row.push_back(source.getCurrentArgumentAs<double>());
    return row;
}

// No driver of the library walks rows; hosts that do rely on this.
TEST(PrintfMatrixArgumentSource, WalksRows) {
    const ArrayPtr matrix = makeDoubles(2, 3, {0, 1, 2, 3, 4, 5});
    const vxArray* argument[] = {matrix.get()};
    printfMatrixArgumentSource source(argument);
    EXPECT_EQ(walkRow(source), (std::vector<double>{0, 2, 4}));
    EXPECT_FALSE(source.hasCurrentArg());
    source.setRow(1);
    EXPECT_EQ(source.remainingArgumentLength(), 3u);
    EXPECT_EQ(walkRow(source), (std::vector<double>{1, 3, 5}));
    source.resetRow();
    EXPECT_EQ(source.getCurrentArgumentAs<double>(), 1);
    source.resetRow();  // only a row walked to its end starts again
    EXPECT_EQ(source.remainingArgumentLength(), 3u);
    EXPECT_EQ(source.getCurrentArgumentAs<double>(), 3);
}

TEST(PrintfMatrixArgumentSource, CountsFurtherDimensionsAsColumns) {
    const ArrayPtr cube = makeNumeric(vxCHAR_CLASS, {2, 2, 2});
    const vxArray* argument[] = {cube.get()};
    printfMatrixArgumentSource source(argument);
    EXPECT_FALSE(source.canUsePercentSOptimization());
    source.setRow(1);
    EXPECT_EQ(walkRow(source).size(), 4u);
}

}  // namespace
