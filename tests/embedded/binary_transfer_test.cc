#include "embedded/builtins/binary_read.h"
#include "embedded/builtins/binary_write.h"
#include "embedded/builtins/open_close.h"
#include "embedded/builtins/positioning.h"
#include "embedded/services/messages.h"
#include "fileio/buffers/vx_data.h"
#include "fileio/errors/code_list.h"
#include "tests/support/test_files.h"

#include <cerrno>
#include <cmath>
#include <cstring>
#include <random>
#include <sstream>
#include <string>
#include <unistd.h>
#include <vector>

#include <gtest/gtest.h>

namespace Orvandeil::FileIO::embedded {
namespace {

using foundation::core::except::IMsgIDException;
using support::TempFile;

std::unique_ptr<OpenFile> open(const TempFile& file, const char* mode,
                               const std::string& encoding = "") {
    return openFile(file.path(), {mode, "native", encoding});
}

// "class rows x columns: values".
std::string summary(const vxArray& array) {
    const std::size_t* lengths = vxArrayDimensions(&array);
    std::string text = std::string(vxArrayClassName(&array)) + ' ' + std::to_string(lengths[0]) +
                       'x' + std::to_string(lengths[1]) + ':';
    const VxData data(const_cast<vxArray*>(&array));
    for (std::size_t i = 0; i < elementCount(array); ++i) {
        char number[32];
        std::snprintf(number, sizeof number, " %.10g", data.getIndexAs<double>(i));
        text += number;
    }
    return text;
}

struct Size {
    std::vector<double> values;  // one or two
    ArrayPtr array() const { return makeDoubles(1, values.size(), values); }
};

constexpr double all = INFINITY;

TEST(BinaryRead, DeliversWhatThePrecisionAsksFor) {
    constexpr const char* letters = "abcdefgh";
    constexpr const char* shorts = "\1\0\2\0\3\0\4\0";
    // The precision stands with machine format and skip: "precision / format / skip".
    const struct {
        int line;
        const char* bytes;  // 8 of them
        const char* call;
        Size size;
        const char* expected;  // the array, the count, and where the file is then
    } rows[] = {
        {__LINE__,
         letters,
         "uchar / n / 0",
         {{all}},
         "double 8x1: 97 98 99 100 101 102 103 104 (8 to 8, end)"},
        // A read of exactly the rest does not meet the end.
        {__LINE__,
         letters,
         "*uint8 / n / 0",
         {{8}},
         "uint8 8x1: 97 98 99 100 101 102 103 104 (8 to 8)"},
        {__LINE__, shorts, "int16=>int8 / l / 0", {{2, 2}}, "int8 2x2: 1 2 3 4 (4 to 8)"},
        {__LINE__, shorts, "*int16 / b / 0", {{3}}, "int16 3x1: 256 512 768 (3 to 6)"},
        {__LINE__,
         "\0\1\0\0\0\0\0\0",
         "uint32=>double / s / 0",
         {{1}},
         "double 1x1: 65536 (1 to 4)"},
        {__LINE__, "\0\0\0\0\0\0\0\7", "*int64 / b / 0", {{all}}, "int64 1x1: 7 (1 to 8, end)"},
        // The last column is filled up with zeros, which do not count; one row becomes a column.
        {__LINE__, shorts, "*int16 / n / 0", {{3, all}}, "int16 3x2: 1 2 3 4 0 0 (4 to 8, end)"},
        {__LINE__, letters, "*uint8 / n / 0", {{1, 4}}, "uint8 4x1: 97 98 99 100 (4 to 4)"},
        {__LINE__, letters, "*uint8 / n / 0", {{0, all}}, "uint8 0x0: (0 to 0)"},
        {__LINE__,
         letters,
         "5*uint8=>uint8 / n / 2",
         {{all}},
         "uint8 6x1: 97 98 99 100 101 104 (6 to 8, end)"},
        // A skip may lead past the end.
        {__LINE__, shorts, "*int16 / n / 1", {{all}}, "int16 3x1: 1 768 4 (3 to 9, end)"},
        // The end of the file within an element: it is consumed, and no element.
        {__LINE__, shorts, "*int32 / n / 1", {{all}}, "int32 1x1: 131073 (1 to 8, end)"},
        // Nothing is skipped behind the last block that is asked for.
        {__LINE__, letters, "2*uint8=>char / n / 1", {{4}}, "char 4x1: 97 98 100 101 (4 to 5)"},
        {__LINE__, letters, "*uint8 / n / 100", {{2}}, "uint8 1x1: 97 (1 to 101, end)"},
        {__LINE__,
         "\0\1\2\377\0\1\2\377",
         "*logical / n / 0",
         {{4}},
         "logical 4x1: 0 1 1 1 (4 to 4)"},
        {__LINE__,
         "\0\1\2\377\0\1\2\377",
         "bool=>double / n / 0",
         {{4}},
         "double 4x1: 0 1 1 1 (4 to 4)"},
        {__LINE__, "\300\xA8zz\0\0\0\0", "single=>int16 / b / 0", {{1}}, "int16 1x1: -5 (1 to 4)"},
        // A size of a read without conversion counts bytes.
        {__LINE__, shorts, "int16=>noconvert / b / 0", {{3}}, "int16 2x1: 256 512 (2 to 4)"},
        {__LINE__,
         "\xE2\x82\xAC\xC3\xA4zzz",
         "*char / n / 0",
         {{3}},
         "char 3x1: 8364 228 122 (3 to 6)"},
        {__LINE__,
         "\xE2\x82\xAC\xC3\xA4zzz",
         "char*1=>char / b / 0",
         {{3}},
         "char 3x1: 226 130 172 (3 to 3)"},
        {__LINE__, letters, "2*char=>double / n / 3", {{3}}, "double 3x1: 97 98 102 (3 to 6)"},
        {__LINE__,
         "\x12\x34\x56zzzzz",
         "ubit12=>uint16 / b / 0",
         {{2}},
         "uint16 2x1: 291 1110 (2 to 3)"},
        {__LINE__,
         "\x12\x34\x56zzzzz",
         "bit4in8=>noconvert / b / 0",
         {{3}},
         "int8 3x1: 1 3 5 (3 to 3)"},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE("line " + std::to_string(row.line));
        std::istringstream call(row.call);
        std::string precision;
        std::string format;
        std::string slash;
        double skip = 0;
        call >> precision >> slash >> format >> slash >> skip;
        const TempFile content(std::string(row.bytes, 8));
        auto file = open(content, "r", "UTF-8");
        const ReadAttributes attributes(precision, MachineFormat(format.c_str()),
                                        row.size.array().get(), makeScalar(skip).get());
        const ReadResult result = readBinary(*file, attributes);
        EXPECT_FALSE(result.failure);
        EXPECT_EQ(summary(*result.array) + " (" + std::to_string(result.count) + " to " +
                      std::to_string(tell(*file)) + (endOfFile(*file) ? ", end)" : ")"),
                  row.expected);
    }
}

// A size far beyond the file is no reason to allocate it.
TEST(BinaryRead, TakesMemoryOnlyForWhatIsThere) {
    const TempFile content("abc");
    auto file = open(content, "r");
    const ArrayPtr size = makeScalar(281474976710655.0);
    const ReadResult result =
        readBinary(*file, ReadAttributes("*double", MachineFormat(), size.get()));
    EXPECT_EQ(result.count, 0u);
    rewind(*file);
    EXPECT_EQ(readBinary(*file, ReadAttributes("*uint8", MachineFormat(), size.get())).count, 3u);
}

// Strided reads of random shapes against picking from the bytes one block at a time.
TEST(BinaryRead, PicksBlocksAsOneByOneReadingWould) {
    std::mt19937 random(3);
    for (int round = 0; round < 300; ++round) {
        std::string bytes(random() % 700, '\0');
        for (char& byte : bytes)
            byte = static_cast<char>(random());
        const std::size_t block = random() % 5 + 1;
        const std::size_t elementSize = 1u << random() % 4;
        const std::size_t skip = random() % 20 + 1;
        const std::size_t wanted = round % 3 == 0 ? 1000000 : random() % 60;
        const char* const type[] = {"", "uint8", "uint16", "", "uint32", "", "", "", "uint64"};

        std::string picked;
        std::size_t place = 0;
        std::size_t count = 0;
        while (count < wanted && place + elementSize <= bytes.size()) {
            picked += bytes.substr(place, elementSize);
            place += elementSize;
            if (++count % block == 0 && count < wanted) place += skip;
        }
        SCOPED_TRACE("round " + std::to_string(round));
        const TempFile content(bytes);
        auto file = open(content, "r");
        const std::string name = type[elementSize];
        const ReadAttributes attributes(std::to_string(block) + '*' + name + "=>" + name,
                                        MachineFormat(),
                                        makeScalar(static_cast<double>(wanted)).get(),
                                        makeScalar(static_cast<double>(skip)).get());
        const ReadResult result = readBinary(*file, attributes);
        ASSERT_EQ(result.count, count);
        if (count != 0) {
            EXPECT_EQ(std::memcmp(vxArrayData(result.array.get()), picked.data(), picked.size()),
                      0);
        }
        EXPECT_EQ(endOfFile(*file), count < wanted);
        if (count == wanted) {
            EXPECT_EQ(tell(*file), static_cast<long>(place));
        }
    }
}

TEST(BinaryRead, DropsWhatAPipeCannotSkip) {
    int ends[2];
    ASSERT_EQ(pipe(ends), 0);
    ASSERT_EQ(::write(ends[1], "abcdefghij", 10), 10);
    ::close(ends[1]);
    OpenFile file("pipe", FileHandle(fdopen(ends[0], "r")), FilePermission(), MachineFormat());
    file.stream = std::make_unique<fileStream>(file.handle.get(), "", file.permission, u"pipe");
    const ReadResult result = readBinary(
        file, ReadAttributes("2*uint8=>uint8", MachineFormat(), nullptr, makeScalar(3).get()));
    EXPECT_EQ(summary(*result.array), "uint8 4x1: 97 98 102 103");
    EXPECT_FALSE(result.failure);
}

TEST(BinaryWrite, PutsTheBytesOfThePrecision) {
    const auto numbers = [](std::initializer_list<double> values) {
        return makeDoubles(1, values.size(), values);
    };
    const struct {
        int line;
        ArrayPtr value;
        const char* precision;
        double skip;
        const char* format;
        std::string bytes;
        unsigned long count;
    } rows[] = {
        {__LINE__, numbers({1, -2.5, 300, NAN}), "int8", 0, "n", {"\x01\xFD\x7F\0", 4}, 4},
        {__LINE__, numbers({1, 258}), "uint16", 0, "b", {"\0\1\1\2", 4}, 2},
        {__LINE__, makeDoubles(2, 2, {1, 2, 3, 4}), "uint8", 0, "n", "\1\2\3\4", 4},
        {__LINE__, numbers({1.5}), "single", 0, "b", {"\x3F\xC0\0\0", 4}, 1},
        {__LINE__, numbers({1, 2, 3}), "uint8", 2, "n", {"\1\0\0\2\0\0\3", 7}, 3},
        {__LINE__, numbers({1, 2, 3}), "2*uint8", 2, "n", {"\1\2\0\0\3", 5}, 3},
        {__LINE__, numbers({0, 2, -1}), "logical", 0, "n", {"\0\1\0", 3}, 3},
        {__LINE__,
         makeRow<std::int16_t>(vxINT16_CLASS, {1, -2}),
         "noconvert",
         0,
         "b",
         {"\0\1\xFF\xFE", 4},
         2},
        {__LINE__,
         makeRow<std::int16_t>(vxINT16_CLASS, {1, -2}),
         "int16",
         0,
         "n",
         {"\1\0\xFE\xFF", 4},
         2},
        {__LINE__, makeChars(u"h\u00E9"), "char", 0, "n", "h\xC3\xA9", 2},
        {__LINE__, makeChars(u"h\u00E9\u20AC"), "char*1", 0, "n", "h\xE9\xFF", 3},
        {__LINE__, numbers({0x20AC}), "char", 0, "n", "\xE2\x82\xAC", 1},
        {__LINE__, numbers({1, 2, 3, 4095}), "ubit12", 0, "b", {"\0\x10\2\0\x3F\xFF", 6}, 4},
        {__LINE__, numbers({-1, 1}), "bit3in8", 0, "n", "\7\1", 2},
        {__LINE__, numbers({}), "double", 0, "n", "", 0},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE("line " + std::to_string(row.line));
        const TempFile content;
        auto file = open(content, "w");
        const WriteAttributes attributes(*row.value, row.precision, MachineFormat(row.format),
                                         makeScalar(row.skip).get());
        const WriteResult result = writeBinary(*file, *row.value, attributes);
        EXPECT_EQ(result.count, row.count);
        EXPECT_FALSE(result.failure);
        // Without a flush of its own: the permission asks for one after every write.
        EXPECT_EQ(content.content(), row.bytes);
        EXPECT_FALSE(closeFile(std::move(file)));
    }
}

TEST(BinaryTransfer, SwitchesDirectionWhereItStands) {
    const TempFile content("abcdef");
    auto file = open(content, "r+");
    const ArrayPtr two = makeScalar(2);
    const auto readTwo = [&] {
        return summary(
            *readBinary(*file, ReadAttributes("*uint8", MachineFormat(), two.get())).array);
    };
    const auto writeByte = [&](double value) {
        const ArrayPtr array = makeScalar(value);
        writeBinary(*file, *array, WriteAttributes(*array, "uint8", MachineFormat()));
    };
    EXPECT_EQ(readTwo(), "uint8 2x1: 97 98");
    writeByte('X');
    EXPECT_EQ(readTwo(), "uint8 2x1: 100 101");
    EXPECT_EQ(readTwo(), "uint8 1x1: 102");
    writeByte('Y');  // at the end, which the read has met
    EXPECT_FALSE(closeFile(std::move(file)));
    EXPECT_EQ(content.content(), "abXdefY");
}

TEST(BinaryTransfer, RefusesTheWrongDirectionAndKeepsWhatWentWell) {
    const TempFile content("ab");
    const ArrayPtr one = makeScalar(1);
    const WriteAttributes bytes(*one, "uint8", MachineFormat());
    const auto codeOf = [](auto call) {
        try {
            call();
        } catch (const CodeError& error) {
            return error.code;
        }
        return 0;
    };
    for (const char* mode : {"a", "W"}) {
        auto file = open(content, mode);
        const ReadAttributes attributes("uint8", MachineFormat());
        EXPECT_EQ(codeOf([&] { readBinary(*file, attributes); }), code::IsOpenWrite);
    }
    auto input = open(content, "r");
    EXPECT_EQ(codeOf([&] { writeBinary(*input, *one, bytes); }), code::IsOpenRead);

    auto full = openFile("/dev/full", {"w", "native", ""});
    EXPECT_EQ(writeBinary(*full, *one, bytes).failure->code, ENOSPC);
    closeFile(std::move(full));
    full = openFile("/dev/full", {"W", "native", ""});
    EXPECT_FALSE(writeBinary(*full, *one, bytes).failure);
    EXPECT_EQ(closeFile(std::move(full))->code, ENOSPC);

    auto far = open(content, "r");
    const ArrayPtr skip = makeRow<std::int64_t>(vxINT64_CLASS, {INT64_MAX});
    const ReadResult result =
        readBinary(*far, ReadAttributes("uint8", MachineFormat(), nullptr, skip.get()));
    EXPECT_EQ(result.failure, std::nullopt);  // the file has ended before the first skip
}

TEST(BinaryTransfer, ValidatesInOrder) {
    const ArrayPtr bad = makeChars(u"x");
    const ArrayPtr good = makeScalar(1);
    const MachineFormat badFormat("middle");
    const MachineFormat format;
    const auto identifierOf = [](auto call) -> std::string {
        try {
            call();
        } catch (const IMsgIDException& error) {
            return error.GetID();
        }
        return "";
    };
    const struct {
        int line;
        const MachineFormat& format;
        const char* precision;
        const vxArray* size;
        const char* identifier;
    } rows[] = {
        {__LINE__, badFormat, "nonsense", bad.get(), "KESTRA:legacy_two_part:badmachformat_vx"},
        {__LINE__, format, "nonsense", bad.get(), "KESTRA:legacy_two_part:badprecision_vx"},
        {__LINE__, format, "noconvert", bad.get(), "KESTRA:legacy_two_part:badprecision_vx"},
        {__LINE__, format, "uint8", bad.get(), "KESTRA:FileIO:sizeMustBeNumeric"},
        {__LINE__, format, "uint8", good.get(), "KESTRA:legacy_two_part:badskip_vx"},
    };
    for (const auto& row : rows) {
        EXPECT_EQ(
            identifierOf([&] { ReadAttributes(row.precision, row.format, row.size, bad.get()); }),
            row.identifier)
            << "line " << row.line;
    }
    EXPECT_EQ(identifierOf([&] { WriteAttributes(*good, "uint8=>int8", format); }),
              "KESTRA:legacy_two_part:badprecision_vx");
    EXPECT_EQ(identifierOf([&] { WriteAttributes(*makeString(u"a"), "uint8", format); }),
              "KESTRA:UnableToConvert");
    const WarningRecorder recorder;
    const ReadAttributes warned("int7", format);
    EXPECT_EQ(recorder.identifiers(),
              std::vector<std::string>{"KESTRA:FileIO:InvalidIntPrecision"});
}

}  // namespace
}  // namespace Orvandeil::FileIO::embedded
