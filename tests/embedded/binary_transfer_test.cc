#include "embedded/builtins/binary_read.h"
#include "embedded/builtins/binary_write.h"
#include "embedded/builtins/bit_fields.h"
#include "embedded/builtins/open_close.h"
#include "embedded/builtins/positioning.h"
#include "fileio/errors/code_list.h"
#include "tests/support/arrays.h"
#include "tests/support/raised.h"
#include "tests/support/test_files.h"

#include <algorithm>
#include <cerrno>
#include <cmath>
#include <functional>
#include <random>
#include <set>
#include <string>
#include <unistd.h>
#include <vector>

#include <gtest/gtest.h>

namespace Orvandeil::FileIO::embedded {
namespace {

using fileio_tests::codeOf;
using support::TempFile;

std::unique_ptr<OpenFile> open(const TempFile& file, const char* mode) {
    return openFile(file.path(), {mode, "n", ""});
}

// The values, and a failure where there was one.
std::string read(OpenFile& file, const std::string& precision, double count, double skip = 0,
                 const char* format = "native") {
    const ArrayPtr size = makeScalar(count);
    const ArrayPtr skipped = makeScalar(skip);
    const ReadResult result = readBinary(
        file, ReadAttributes(precision, MachineFormat(format), size.get(), skipped.get()));
    const std::string code = result.failure ? ", " + std::to_string(result.failure->code) : "";
    return support::listed(vxArrayClassID(result.array.get()), vxArrayData(result.array.get()),
                           result.count) +
           code;
}

std::optional<Failure> write(OpenFile& file, const std::string& precision, const ArrayPtr& values,
                             double skip = 0, const char* format = "native") {
    const ArrayPtr skipped = makeScalar(skip);
    const WriteAttributes attributes(*values, precision, MachineFormat(format), skipped.get());
    const WriteResult result = writeBinary(file, *values, attributes);
    EXPECT_TRUE(result.failure || result.count == elementCount(*values));
    return result.failure;
}

TEST(BinaryRead, DropsWhatAPipeCannotSkip) {
    int ends[2];
    ASSERT_EQ(pipe(ends), 0);
    ASSERT_EQ(::write(ends[1], "abcdefghij", 10), 10);
    ::close(ends[1]);
    OpenFile file("pipe", FileHandle(fdopen(ends[0], "r")), FilePermission(), MachineFormat());
    file.stream = std::make_unique<fileStream>(file.handle.get(), "", file.permission, u"pipe");
    EXPECT_EQ(read(file, "2*uint8=>uint8", INFINITY, 3), "97 98 102 103");
}

TEST(BinaryTransfer, RefusesTheWrongDirection) {
    const TempFile content("ab");
    for (const char* mode : {"a", "W"})
        EXPECT_EQ(codeOf([&] { read(*open(content, mode), "uint8", 1); }), code::IsOpenWrite);
    EXPECT_EQ(codeOf([&] { write(*open(content, "r"), "uint8", makeScalar(1)); }),
              code::IsOpenRead);
    // Only the permission "w" asks for a flush after every write.
    EXPECT_EQ(write(*openFile("/dev/full", {"w", "n", ""}), "uint8", makeScalar(1))->code, ENOSPC);
    EXPECT_FALSE(write(*openFile("/dev/full", {"W", "n", ""}), "uint8", makeScalar(1)));
}

// A file as single bits. In big-endian order, bytes and elements begin with their highest bit, else
// with their lowest.
struct BitFile {
    std::uint64_t transfer(bool isWrite, std::uint64_t element, int count) {
        std::uint64_t value = 0;
        for (int i = 0; i < count; ++i, ++bit) {
            const int shift = bigEndian ? count - 1 - i : i;
            const std::size_t place = bigEndian ? bit ^ 7 : bit;
            if (isWrite) bits[place] = element >> shift & 1;
            value |= std::uint64_t{bits[place]} << shift;
        }
        return value;
    }
    void align() { bit = (bit + 7) / 8 * 8; }
    std::string bytes() const {
        std::string run(bits.size() / 8, '\0');
        for (std::size_t i = 0; i < bits.size(); ++i)
            run[i / 8] = static_cast<char>(run[i / 8] | bits[i] << i % 8);
        return run;
    }

    std::vector<bool> bits;
    std::size_t bit = 0;
    bool bigEndian = false;
};

struct Elements {
    std::string type;
    int bits, stride;
    std::size_t block, skip;  // elements, bytes
};

// The same transfer by file and by model.
void transfer(OpenFile& file, BitFile& model, bool isWrite, const Elements& elements,
              std::vector<std::uint64_t> values) {
    const bool isSigned = elements.type[0] == 'b';
    const auto wanted = static_cast<double>(values.size());
    const auto stride = static_cast<std::size_t>(elements.stride);
    for (std::size_t i = 0; i < values.size(); ++i) {
        if (i != 0 && i % elements.block == 0 && elements.skip != 0) {
            model.align();
            model.bit += 8 * elements.skip;
        }
        if (model.bit + stride > model.bits.size()) {
            model.bit = std::max(model.bit, model.bits.size());
            values.resize(i);
            break;
        }
        values[i] = model.transfer(isWrite, values[i], elements.bits);
        if (isSigned)
            values[i] = static_cast<std::uint64_t>(signExtended(values[i], elements.bits));
        model.transfer(isWrite, 0, elements.stride - elements.bits);
    }
    const vxClassID classID = isSigned ? vxINT64_CLASS : vxUINT64_CLASS;
    const std::string precision = std::to_string(elements.block) + '*' + elements.type;
    const auto skip = static_cast<double>(elements.skip);
    const char* const format = model.bigEndian ? "big-endian" : "little-endian";
    if (isWrite) {
        const ArrayPtr array = makeNumeric(classID, {values.size()});
        std::ranges::copy(values, static_cast<std::uint64_t*>(realData(*array)));
        EXPECT_FALSE(write(file, precision, array, skip, format));
    } else {
        EXPECT_EQ(read(file, precision + "=>" + nameOfClass(classID), wanted, skip, format),
                  support::listed(classID, values.data(), values.size()));
    }
}

// Elements of random widths, signs, strides, blocks and skips; whole bytes are plain ones as well.
Elements anyElements(const std::function<int(int)>& below, bool arePlain) {
    const int bits = arePlain ? 8 << below(4) : 1 + below(64);
    const int stride = arePlain ? bits : bits + below(65 - bits);
    const std::string width = std::to_string(bits);
    const std::string field =
        (below(2) == 0 ? "bit" : "ubit") + width + "in" + std::to_string(stride);
    const auto block = static_cast<std::size_t>(1 + below(5));
    const auto skip = static_cast<std::size_t>(below(4) == 0 ? below(20) : 0);
    return {arePlain ? "uint" + width : field, bits, stride, block, skip};
}

// Transfers with seeks and flushes between them. Fields that do not go on in the same direction and
// order begin at the next whole byte.
TEST(BinaryTransfer, AgreesWithTheModel) {
    std::mt19937_64 random(7);
    const auto below = [&](int limit) { return static_cast<int>(random() >> 33) % limit; };
    std::set<std::vector<int>> seen;
    for (int round = 0; round < 700; ++round) {
        BitFile model{std::vector<bool>(8 * 4000)};
        for (std::size_t i = 0; i < model.bits.size(); ++i)
            model.bits[i] = random() & 1;
        const TempFile content(model.bytes());
        auto file = open(content, "r+");
        bool isWrite = false;
        for (int step = 0; step < 60; ++step) {
            SCOPED_TRACE("round " + std::to_string(round) + ", step " + std::to_string(step));
            enum { Seek, Flush, Plain };
            const int action = below(20);
            const bool turns = below(5) == 0, swaps = below(9) == 0;
            // The current byte is the one partly written, or the one behind that partly read.
            if (action == Seek && isWrite) model.bit -= model.bit % 8;
            if (action <= Plain || turns || swaps) model.align();
            isWrite = isWrite != turns;
            model.bigEndian = model.bigEndian != swaps;
            const Elements elements = anyElements(below, action == Plain);
            if (action == Seek) {
                seek(*file, 2, Origin::Current);
                model.bit += 16;
            } else if (action == Flush) {
                EXPECT_FALSE(flushFile(*file));
            } else {
                std::vector<std::uint64_t> values(random() % 7);
                std::ranges::generate(values, random);
                seen.insert(
                    {elements.bits, static_cast<int>(model.bit % 8), isWrite, model.bigEndian});
                transfer(*file, model, isWrite, elements, values);
            }
            const std::size_t bit = isWrite ? model.bit : model.bit + 7;
            ASSERT_EQ(tell(*file), static_cast<long>(bit / 8));
        }
        // To the end and no bit further: what is left of the last byte is no element.
        seek(*file, -below(400), Origin::End);
        model.bit = 8 * static_cast<std::size_t>(tell(*file));
        transfer(*file, model, false, anyElements(below, round % 2 == 0),
                 std::vector<std::uint64_t>(4000));
        EXPECT_TRUE(endOfFile(*file));
        EXPECT_EQ(tell(*file), static_cast<long>(model.bit / 8));
        EXPECT_FALSE(closeFile(std::move(file)));
        ASSERT_EQ(content.content(), model.bytes());
    }
    EXPECT_EQ(seen.size(),
              64u * 8 * 2 * 2);  // every width from every bit, both ways, in both orders
}

TEST(BitFields, ThatCannotBeSettledAreTold) {
    const TempFile content;
    for (const char* mode : {"a", "r+"}) {
        auto file = open(content, mode);
        EXPECT_FALSE(write(*file, "ubit3", makeScalar(5)));
        EXPECT_EQ(codeOf([&] { write(*file, "uint8", makeScalar(1)); }),
                  code::WriteCarryByteFailed);
        EXPECT_EQ(closeFile(std::move(file))->code, code::WriteCarryByteFailed);
    }
    EXPECT_EQ(content.content(), "");
}

}  // namespace
}  // namespace Orvandeil::FileIO::embedded
