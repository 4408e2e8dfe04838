#include "embedded/builtins/binary_read.h"
#include "embedded/builtins/binary_write.h"
#include "embedded/builtins/open_close.h"
#include "embedded/builtins/positioning.h"
#include "fileio/buffers/element_conversion.h"
#include "fileio/errors/code_list.h"
#include "tests/support/arrays.h"
#include "tests/support/raised.h"
#include "tests/support/test_files.h"

#include <algorithm>
#include <cerrno>
#include <cmath>
#include <random>
#include <span>
#include <string>
#include <unistd.h>

#include <gtest/gtest.h>

namespace Orvandeil::FileIO::embedded {
namespace {

using fileio_tests::codeOf;
using support::TempFile;

std::unique_ptr<OpenFile> open(const TempFile& file, const char* mode) {
    return openFile(file.path(), {mode, "n", ""});
}

// The values, and a failure where there was one.
std::string read(OpenFile& file, const std::string& precision, double count, double skip = 0) {
    const ArrayPtr size = makeScalar(count);
    const ArrayPtr skipped = makeScalar(skip);
    const ReadResult result =
        readBinary(file, ReadAttributes(precision, MachineFormat(), size.get(), skipped.get()));
    const std::string code = result.failure ? ", " + std::to_string(result.failure->code) : "";
    return support::listed(vxArrayClassID(result.array.get()), vxArrayData(result.array.get()),
                           result.count) +
           code;
}

std::optional<Failure> write(OpenFile& file, const std::string& precision, const ArrayPtr& values) {
    const WriteAttributes attributes(*values, precision, MachineFormat());
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

// Reads of many pieces, with ends and skips anywhere, against taking one element at a time.
TEST(BinaryRead, AgreesWithOneElementAtATime) {
    std::mt19937_64 random(3);
    std::string bytes(300000, '\0');
    std::ranges::generate(bytes, [&] { return static_cast<char>(random()); });
    const TempFile content(bytes);
    const vxClassID classes[] = {vxUINT8_CLASS, vxINT16_CLASS, vxSINGLE_CLASS, vxDOUBLE_CLASS};
    for (int round = 0; round < 150; ++round) {
        const vxClassID from = classes[random() % 4], to = classes[random() % 4];
        const std::size_t size = elementBytes(from), start = random() % 9;
        const std::size_t skip = random() % 2 * (random() % 40), block = 1 + random() % 5;
        const std::size_t limit = random() % 2 == 0 ? random() % 100000 : bytes.size();
        const bool isBig = random() % 2 == 0;
        std::string expected;
        std::size_t place = start, end = start, count = 0;
        for (; count < limit && place + size <= bytes.size(); end = place += size) {
            if (count != 0 && count % block == 0 && (place += skip) + size > bytes.size()) break;
            std::string element = bytes.substr(place, size);
            if (isBig) std::ranges::reverse(element);
            expected.resize(expected.size() + elementBytes(to));
            AssignToVoidBuffer(to, &expected.end()[-static_cast<long>(elementBytes(to))], from,
                               element.data(), 1);
            ++count;
        }
        auto file = open(content, "r");
        seek(*file, static_cast<double>(start), Origin::Begin);
        const std::string precision = std::to_string(block) + '*' + nameOfClass(from) + "=>";
        const ReadResult result = readBinary(
            *file, ReadAttributes(precision + nameOfClass(to), MachineFormat(isBig ? "b" : "l"),
                                  makeScalar(static_cast<double>(limit)).get(),
                                  makeScalar(static_cast<double>(skip)).get()));
        SCOPED_TRACE(precision + nameOfClass(to) + ", round " + std::to_string(round));
        ASSERT_EQ(result.count, count);
        ASSERT_FALSE(result.failure);
        const auto* data = static_cast<const char*>(vxArrayData(result.array.get()));
        ASSERT_TRUE(std::ranges::equal(expected, std::span(data, expected.size())));
        ASSERT_EQ(endOfFile(*file), count < limit);
        ASSERT_TRUE(count < limit || tell(*file) == static_cast<long>(end));
    }
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
