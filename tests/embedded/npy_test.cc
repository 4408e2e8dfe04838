#include "embedded/npy/npy_file.h"
#include "tests/support/arrays.h"
#include "tests/support/raised.h"
#include "tests/support/test_files.h"

#include <numeric>
#include <sstream>
#include <string>
#include <string_view>

#include <gtest/gtest.h>

namespace Orvandeil::FileIO::embedded {
namespace {

using namespace std::literals;
using fileio_tests::raisedBy;
using support::shown;
using support::TempFile;

std::string npyText(int version, std::string_view header, std::string_view data) {
    std::string text = "\x93NUMPY"s + static_cast<char>(version) + '\0';
    for (unsigned i = 0; i < (version == 1 ? 2u : 4u); ++i)
        text += static_cast<char>(header.size() >> 8 * i & 0xFF);
    return text.append(header).append(data);
}

std::string dictionary(const std::string& type, const std::string& shape) {
    return "{'descr': '" + type + "', 'fortran_order': False, 'shape': " + shape + ", }  \n";
}

ArrayPtr readText(const std::string& content) {
    return npyRead(TempFile(content).path());
}

std::string errorFor(const std::string& content) {
    const std::string raised = raisedBy([&] { readText(content); });
    return raised.substr(0, raised.find(' '));
}

TEST(Npy, ReadsComplexTypesInAllVersions) {
    const struct {
        int line;
        const char* type;
        std::string_view data;  // two elements
        const char* expected;
    } rows[] = {{__LINE__, ">c8", "\x3F\x80\0\0\xC0\x20\0\0\0\0\0\0\x40\0\0\0"sv,
                 "single 2x1: 1 0 + i -2.5 2"},
                {__LINE__, "<c16",
                 "\0\0\0\0\0\0\xF0\x3F\0\0\0\0\0\0\4\xC0\0\0\0\0\0\0\0\0\0\0\0\0\0\0\0\x40"sv,
                 "double 2x1: 1 0 + i -2.5 2"}};
    for (const auto& row : rows) {
        for (const int version : {1, 2, 3})
            EXPECT_EQ(shown(readText(npyText(version, dictionary(row.type, "(2,)"), row.data))),
                      row.expected)
                << "line " << row.line << ", version " << version;
    }
}

// Every shape of four lengths from 0 to 3; the data are their own index in C order.
TEST(Npy, PutsCOrderIntoColumns) {
    std::string data(81, '\0');
    std::iota(data.begin(), data.end(), '\0');
    for (unsigned code = 0; code < 4 * 4 * 4 * 4; ++code) {
        const unsigned rows = code & 3, columns = code >> 2 & 3, pages = code >> 4 & 3,
                       books = code >> 6;
        std::ostringstream shape;
        shape << '(' << rows << ", " << columns << ", " << pages << ", " << books << ')';
        const ArrayPtr array = readText(npyText(1, dictionary("|u1", shape.str()), data));
        ASSERT_EQ(elementCount(*array), rows * columns * pages * books);
        const auto* const values = static_cast<const unsigned char*>(vxArrayData(array.get()));
        for (unsigned i = 0; i < elementCount(*array); ++i) {
            const unsigned book = i % books, page = i / books % pages;
            const unsigned column = i / books / pages % columns, row = i / books / pages / columns;
            ASSERT_EQ(values[row + rows * (column + columns * (page + pages * book))], i)
                << shape.str();
        }
    }
}

TEST(Npy, RefusesWhatEndsEarlyOrNestsDeeply) {
    const std::string whole = npyText(1, dictionary("<i2", "(3,)"), "abcdef");
    for (std::size_t length = 0; length < whole.size(); ++length)
        EXPECT_EQ(errorFor(whole.substr(0, length)), "KESTRA:npy:truncated") << length;
    EXPECT_EQ(
        errorFor(npyText(2, "{'descr': " + std::string(100000, '[') + ", 'shape': (2,)}", "")),
        "KESTRA:npy:unsupportedType");
}

TEST(Npy, WritesWhatItReads) {
    const TempFile file;
    for (int code = vxLOGICAL_CLASS; code <= vxUINT64_CLASS; ++code) {
        const auto classID = static_cast<vxClassID>(code);
        for (const vxComplexity complexity : {vxREAL, vxCOMPLEX}) {
            if (elementBytes(classID) == 0) continue;
            const ArrayPtr array = makeNumeric(classID, {2, 3, 2}, complexity);
            for (void* const part : {realData(*array), imaginaryData(*array)}) {
                for (std::size_t i = 0; part && i < 12 * elementBytes(classID); ++i)
                    static_cast<char*>(part)[i] = (i * 5 + (part == realData(*array))) % 7 % 2;
            }
            const bool isRefused =
                complexity == vxCOMPLEX && code != vxDOUBLE_CLASS && code != vxSINGLE_CLASS;
            std::string text = shown(array);
            if (classID == vxCHAR_CLASS) text.replace(0, 4, "uint16");
            if (isRefused) text = "KESTRA:npy:unsupportedClass";
            std::string seen = raisedBy([&] { npyWrite(file.path(), *array); });
            seen = seen.empty() ? shown(npyRead(file.path())) : seen.substr(0, seen.find(' '));
            EXPECT_EQ(seen, text);
        }
    }
    npyWrite(file.path(), *makeDoubles(1, 2, {1, 2}));
    EXPECT_EQ(file.content().substr(0, 128),
              "\x93NUMPY\1\0\x76\0{'descr': '<f8', 'fortran_order': True, 'shape': (1, 2), }"s +
                  std::string(59, ' ') + '\n');
    EXPECT_EQ(file.content().size(), 128u + 16u);
}

}  // namespace
}  // namespace Orvandeil::FileIO::embedded
