#include "embedded/builtins/bit_fields.h"

#include "embedded/builtins/binary_read.h"
#include "embedded/builtins/binary_write.h"
#include "embedded/builtins/open_close.h"
#include "embedded/builtins/positioning.h"
#include "fileio/errors/code_list.h"
#include "tests/support/test_files.h"

#include <algorithm>
#include <random>
#include <string>
#include <vector>

#include <gtest/gtest.h>

namespace Orvandeil::FileIO::embedded {
namespace {

using support::TempFile;

// The model: a run of bytes as single bits, in the order in which fields take them.
class BitModel {
public:
    explicit BitModel(bool bigEndianOrder) : bigEndian(bigEndianOrder) {}

    // A field takes its lowest bit first in little-endian order, its highest in big-endian order.
    void append(std::uint64_t value, int count, int stride) {
        for (int i = 0; i < count; ++i)
            bits.push_back((value >> (bigEndian ? count - 1 - i : i)) & 1);
        bits.resize(bits.size() + static_cast<std::size_t>(stride - count));
    }

    std::string bytes() const {
        std::string run((bits.size() + 7) / 8, '\0');
        for (std::size_t i = 0; i < bits.size(); ++i) {
            const std::size_t place = bigEndian ? 7 - i % 8 : i % 8;
            if (bits[i]) run[i / 8] = static_cast<char>(run[i / 8] | 1 << place);
        }
        return run;
    }

private:
    bool bigEndian;
    std::vector<bool> bits;
};

std::string orderName(bool bigEndian) {
    return bigEndian ? "big-endian" : "little-endian";
}

std::unique_ptr<OpenFile> open(const TempFile& file, const char* mode) {
    return openFile(file.path(), {mode, "native", ""});
}

template <class T>
std::vector<T> elements(const vxArray& array) {
    const T* data = static_cast<const T*>(vxArrayData(&array));
    return {data, data + elementCount(array)};
}

// The elements as 64-bit integers, which every field fits; those of unsigned ones by their bits.
std::vector<std::int64_t> readBack(OpenFile& file, const std::string& precision, bool bigEndian,
                                   double count) {
    const MachineFormat format(orderName(bigEndian).c_str());
    const ArrayPtr size = makeScalar(count);
    const bool isUnsigned = precision.starts_with('u');
    const ReadAttributes attributes(precision + (isUnsigned ? "=>uint64" : "=>int64"), format,
                                    size.get());
    const ReadResult result = readBinary(file, attributes);
    EXPECT_FALSE(result.failure);
    return elements<std::int64_t>(*result.array);
}

WriteResult write(OpenFile& file, const std::string& precision, bool bigEndian,
                  const vxArray& value) {
    const MachineFormat format(orderName(bigEndian).c_str());
    return writeBinary(file, value, WriteAttributes(value, precision, format));
}

ArrayPtr row(const std::vector<std::int64_t>& values, vxClassID classID) {
    ArrayPtr array = makeNumeric(classID, {1, values.size()});
    std::copy(values.begin(), values.end(), static_cast<std::int64_t*>(realData(*array)));
    return array;
}

TEST(BitFields, LieWhereTheModelPutsThem) {
    std::mt19937_64 random(7);
    for (const bool bigEndian : {false, true}) {
        for (int bits = 1; bits <= 64; ++bits) {
            for (std::size_t start = 0; start < 8; ++start) {
                const FieldLayout layout{bits, bits, bigEndian};
                const std::uint64_t value = random() & highestUnsigned(bits);
                BitModel model(bigEndian);
                model.append(0, static_cast<int>(start), static_cast<int>(start));
                model.append(value, bits, bits);
                std::string stored(model.bytes().size() + fieldReach, '\0');
                auto* const bytes = reinterpret_cast<unsigned char*>(stored.data());
                storeField(bytes, start, layout, value);
                EXPECT_EQ(stored.substr(0, model.bytes().size()), model.bytes())
                    << bits << " bits from " << start << ", big-endian " << bigEndian;
                std::fill(stored.begin() + static_cast<std::ptrdiff_t>(model.bytes().size()),
                          stored.end(), '\xFF');
                EXPECT_EQ(loadField(bytes, start, layout), value);
            }
        }
    }
}

// Every width, sign and order; the values are written and read in calls of random lengths, so that
// most calls begin within a byte.
TEST(BitFields, ContinueFromCallToCall) {
    std::mt19937_64 random(11);
    for (int variant = 0; variant < 64 * 4; ++variant) {
        const int bits = variant / 4 + 1;
        const bool isSigned = variant & 1;
        const bool bigEndian = variant & 2;
        const int stride = bits + static_cast<int>(random() % static_cast<unsigned>(65 - bits));
        const std::string precision =
            (isSigned ? "bit" : "ubit") + std::to_string(bits) + "in" + std::to_string(stride);
        SCOPED_TRACE(precision + ", " + orderName(bigEndian));
        BitModel model(bigEndian);
        std::vector<std::int64_t> values(40);
        for (std::int64_t& value : values) {
            const std::uint64_t field = random() & highestUnsigned(bits);
            value = isSigned ? signExtended(field, bits) : static_cast<std::int64_t>(field);
            model.append(field, bits, stride);
        }
        const auto calls = [&random, &values](auto call) {
            for (std::size_t from = 0; from < values.size();) {
                const std::size_t count = std::min(random() % 7, values.size() - from);
                call(from, count);
                from += count;
            }
        };

        const TempFile file;
        auto output = open(file, "w");
        calls([&](std::size_t from, std::size_t count) {
            const auto first = values.begin() + static_cast<std::ptrdiff_t>(from);
            const ArrayPtr part = row({first, first + static_cast<std::ptrdiff_t>(count)},
                                      isSigned ? vxINT64_CLASS : vxUINT64_CLASS);
            EXPECT_EQ(write(*output, precision, bigEndian, *part).count, count);
        });
        EXPECT_FALSE(closeFile(std::move(output)));
        EXPECT_EQ(file.content(), model.bytes());

        auto input = open(file, "r");
        calls([&](std::size_t from, std::size_t count) {
            const auto part = readBack(*input, precision, bigEndian, static_cast<double>(count));
            const auto first = values.begin() + static_cast<std::ptrdiff_t>(from);
            EXPECT_TRUE(std::equal(part.begin(), part.end(), first,
                                   first + static_cast<std::ptrdiff_t>(count)));
        });
    }
}

TEST(BitFields, SaturateToTheirRange) {
    const struct {
        int line;
        const char* precision;
        std::vector<double> values;
        std::vector<std::int64_t> expected;
    } rows[] = {
        {__LINE__, "bit3", {-100, -5, -4, 3, 4, 2.5, NAN}, {-4, -4, -4, 3, 3, 3, 0}},
        {__LINE__, "ubit3", {-1, 7, 8, 1e300}, {0, 7, 7, 7}},
        {__LINE__, "bit1", {-7, 0, 1}, {-1, 0, 0}},
        {__LINE__, "bit64", {-1e300, 1e300}, {INT64_MIN, INT64_MAX}},
        {__LINE__, "bit8", {-129, 127.5}, {-128, 127}},
    };
    for (const auto& row : rows) {
        const TempFile file;
        auto output = open(file, "w");
        write(*output, row.precision, false, *makeDoubles(1, row.values.size(), row.values));
        closeFile(std::move(output));
        auto input = open(file, "r");
        EXPECT_EQ(readBack(*input, row.precision, false, static_cast<double>(row.values.size())),
                  row.expected)
            << "line " << row.line;
    }
}

// What is left of the last byte at the end of the data is no field, and is dropped.
TEST(BitFields, NeedAllTheirBits) {
    const TempFile file("\xFF\xFF\xFF");
    auto input = open(file, "r");
    EXPECT_EQ(readBack(*input, "ubit5", true, 3).size(), 3u);
    EXPECT_EQ(tell(*input), 2);
    EXPECT_EQ(input->carry().pendingBits, 1);
    EXPECT_EQ(input->carry().carryValue, 0x01);
    EXPECT_FALSE(endOfFile(*input));
    EXPECT_EQ(readBack(*input, "ubit5", true, INFINITY).size(), 1u);
    EXPECT_EQ(input->carry().pendingBits, 0);
    EXPECT_TRUE(endOfFile(*input));
}

// Steps on one update file over the bytes FF 00 FF 00; each row is a sequence of its own.
TEST(BitFields, AreSettledByWhatComesNext) {
    enum class Step { ReadBits, WriteBits, WriteOtherOrder, WriteByte, ReadByte, Seek1, Flush };
    using enum Step;
    const struct {
        int line;
        std::vector<Step> steps;  // those of bits take 3 and write 101, in big-endian order
        long position;
        const char* bytes;  // after closing
    } rows[] = {
        {__LINE__, {WriteBits}, 0, "BF 00 FF 00"},
        {__LINE__, {WriteBits, WriteBits}, 0, "B7 00 FF 00"},
        {__LINE__, {WriteBits, WriteBits, WriteBits}, 1, "B6 80 FF 00"},
        {__LINE__, {ReadBits, WriteBits}, 1, "FF A0 FF 00"},
        {__LINE__, {WriteBits, ReadBits}, 2, "BF 00 FF 00"},
        {__LINE__, {WriteBits, ReadByte}, 2, "BF 00 FF 00"},
        {__LINE__, {ReadBits, ReadByte}, 2, "FF 00 FF 00"},
        {__LINE__, {WriteBits, WriteByte}, 2, "BF 41 FF 00"},
        {__LINE__, {ReadBits, WriteByte, ReadByte}, 3, "FF 41 FF 00"},
        {__LINE__, {WriteBits, WriteOtherOrder}, 1, "BF 05 FF 00"},
        {__LINE__, {WriteBits, Flush}, 1, "BF 00 FF 00"},
        {__LINE__, {WriteBits, Seek1, WriteBits}, 1, "BF A0 FF 00"},
    };
    const auto hex = [](const std::string& bytes) {
        std::string text;
        for (const char byte : bytes) {
            char digits[4];
            std::snprintf(digits, sizeof digits, "%02X ", static_cast<unsigned char>(byte));
            text += digits;
        }
        return text.substr(0, text.size() - 1);
    };
    const MachineFormat native;
    const ArrayPtr field = makeScalar(5);
    for (const auto& row : rows) {
        SCOPED_TRACE("line " + std::to_string(row.line));
        const TempFile content(std::string("\xFF\0\xFF\0", 4));
        auto file = open(content, "r+");
        for (const Step step : row.steps) {
            if (step == ReadBits) readBack(*file, "ubit3", true, 1);
            if (step == WriteBits) write(*file, "ubit3", true, *field);
            if (step == WriteOtherOrder) write(*file, "ubit3", false, *field);
            if (step == WriteByte) write(*file, "uint8", true, *makeScalar(0x41));
            if (step == ReadByte) {
                readBinary(*file, ReadAttributes("uint8", native, makeScalar(1).get()));
            }
            if (step == Seek1) seek(*file, 1, Origin::Current);
            if (step == Flush) {
                EXPECT_FALSE(flushFile(*file));
            }
        }
        EXPECT_EQ(tell(*file), row.position);
        EXPECT_FALSE(closeFile(std::move(file)));
        EXPECT_EQ(hex(content.content()), row.bytes);
    }
}

TEST(BitFields, ThatCannotBeSettledAreTold) {
    const struct {
        int line;
        const char* mode;
        int cause;
    } rows[] = {{__LINE__, "a", code::IsOpenWrite}, {__LINE__, "r+", code::ReadFailed}};
    for (const auto& row : rows) {
        const TempFile content;
        auto file = open(content, row.mode);
        EXPECT_FALSE(write(*file, "ubit3", true, *makeScalar(5)).failure);
        try {
            write(*file, "uint8", true, *makeScalar(1));
            ADD_FAILURE() << "line " << row.line;
        } catch (const CodeError& error) {
            EXPECT_EQ(error.code, code::WriteCarryByteFailed) << "line " << row.line;
        }
        EXPECT_EQ(errorOf(*file).code, row.cause) << "line " << row.line;
        EXPECT_EQ(closeFile(std::move(file))->code, code::WriteCarryByteFailed);
        EXPECT_EQ(content.content(), "");
    }
}

// Bytes are skipped from the next whole byte on, in both directions.
TEST(BitFields, SkipWholeBytes) {
    const MachineFormat native;
    const ArrayPtr skip = makeScalar(2);
    const ArrayPtr values = makeDoubles(1, 5, {1, 2, 3, 4, 5});
    const TempFile content;
    auto file = open(content, "w+");
    writeBinary(*file, *values, WriteAttributes(*values, "2*ubit12", native, skip.get()));
    closeFile(std::move(file));
    EXPECT_EQ(content.content(), std::string("\x01\x20\0\0\0\x03\x40\0\0\0\x05\0", 12));
    file = open(content, "r");
    const ReadResult result =
        readBinary(*file, ReadAttributes("2*ubit12", native, makeScalar(5).get(), skip.get()));
    EXPECT_EQ(elements<double>(*result.array), (std::vector<double>{1, 2, 3, 4, 5}));
    EXPECT_EQ(tell(*file), 12);
}

}  // namespace
}  // namespace Orvandeil::FileIO::embedded
