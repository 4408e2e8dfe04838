#include "embedded/builtins/binary_read.h"
#include "embedded/builtins/binary_write.h"
#include "embedded/builtins/open_close.h"
#include "embedded/builtins/positioning.h"
#include "fileio/errors/code_list.h"
#include "tests/support/arrays.h"
#include "tests/support/raised.h"
#include "tests/support/test_files.h"

#include <cerrno>
#include <cmath>
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
