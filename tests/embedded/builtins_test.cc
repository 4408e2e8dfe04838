#include "embedded/builtins/binary_read.h"
#include "embedded/builtins/binary_write.h"
#include "embedded/builtins/file_table.h"
#include "embedded/builtins/open_close.h"
#include "embedded/builtins/positioning.h"
#include "embedded/builtins/print.h"
#include "embedded/builtins/progress_line.h"
#include "embedded/builtins/scan.h"
#include "embedded/builtins/text_lines.h"
#include "embedded/services/memory.h"
#include "fileio/errors/code_list.h"
#include "tests/support/arrays.h"
#include "tests/support/raised.h"
#include "tests/support/test_files.h"

#include <cerrno>
#include <cmath>
#include <cstdlib>
#include <fcntl.h>
#include <poll.h>
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

TEST(FileTable, KeepsFilesAtTheirAddresses) {
    const TempFile content("a");
    FileTable table;
    const int one = table.open(content.path(), {});
    OpenFile* const address = &table.file(one);
    for (int i = 1; i < 20; ++i)
        EXPECT_EQ(table.open(content.path(), {}), one + i);
    EXPECT_EQ(&table.file(one), address);
    EXPECT_EQ(table.file(one).label, content.path());
    EXPECT_EQ(table.close(one), std::nullopt);
    EXPECT_EQ(codeOf([&] { table.file(one); }), EBADF);
    EXPECT_EQ(codeOf([&] { table.close(FileTable::standardInput); }), EBADF);
    EXPECT_EQ(table.open(content.path(), {"r+", "b", ""}), one);
    EXPECT_EQ(table.file(one).format.dataSizeType, 1);
    EXPECT_EQ(table.numbers().size(), 20u);
    OpenFile& console = table.file(FileTable::console);
    EXPECT_EQ(tell(console), -1);
    EXPECT_EQ(codeOf([&] { seek(console, 0, Origin::Begin); }), code::FseekFailed);
}

TEST(Positioning, StaysWithinTheFile) {
    const TempFile content("0123456789");
    auto file = openFile(content.path(), {"r+", "n", ""});
    const auto codeOfSeek = [&](double offset, Origin origin) {
        return codeOf([&] { seek(*file, offset, origin); });
    };
    double position = 0;
    for (const Origin origin : {Origin::Begin, Origin::Current, Origin::End}) {
        for (const double offset : {4.0, -double(INFINITY), -1e300, -11.0, -10.0, -5.0, 0.0, 3.0,
                                    10.0, 11.0, 9223372036854774784.0, 1e300, double(INFINITY)}) {
            const double base = origin == Origin::Begin ? 0 : origin == Origin::End ? 10 : position;
            const double target = base + offset;
            const int expected = target < 0    ? code::BadOffsetBeforeBegin
                                 : target > 10 ? code::BadOffsetAfterEnd
                                               : 0;
            EXPECT_EQ(codeOfSeek(offset, origin), expected) << base << " and " << offset;
            if (expected == 0) position = target;
            EXPECT_EQ(tell(*file), static_cast<long>(position)) << base << " and " << offset;
        }
        EXPECT_EQ(codeOfSeek(NAN, origin), code::BadOffsetNaN);
        EXPECT_EQ(codeOfSeek(1.5, origin), code::BadOffsetInt);
    }
}

TEST(OpenFile, IsPrintedAndRead) {
    const TempFile content;
    auto file = openFile(content.path(), {"W+", "n", ""});
    EXPECT_FALSE(print(*file, u"12345", {}));
    // What is only in the buffer counts, too.
    seek(*file, 5, Origin::Begin);
    EXPECT_EQ(codeOf([&] { seek(*file, 6, Origin::Begin); }), code::BadOffsetAfterEnd);
    rewind(*file);
    EXPECT_EQ(readLine(*file)->text(), u"12345");
    EXPECT_TRUE(endOfFile(*file));
    EXPECT_EQ(errorOf(*file).code, 0);
    EXPECT_EQ(errorOf(*file).message, u"");
    rewind(*file);
    EXPECT_FALSE(endOfFile(*file));
    EXPECT_EQ(codeOf([&] { print(*openFile(content.path(), {}), u"x", {}); }), code::IsOpenRead);
    auto output = openFile(content.path(), {"w", "n", ""});
    EXPECT_EQ(codeOf([&] { readLine(*output); }), code::IsOpenWrite);
    EXPECT_EQ(codeOf([&] { scan(*output, u"%d", SizeAttribute()); }), code::IsOpenWrite);
}

TEST(Scan, KeepsTheValuesBeforeAFieldTooLongForTheMemory) {
    const std::u16string text = u"7 " + std::u16string(5000, u'x');
    ScanResult result;
    bool kept = false;
    for (std::size_t nth = 1; result.count < 2; ++nth) {
        const FailingAllocation failing(nth);
        try {
            result = scanText(text, "", u"%d%s", SizeAttribute());
        } catch (const OutOfMemoryError&) {
            continue;
        }
        EXPECT_EQ(result.code, failing.happened() ? code::NoMemory : 0) << "allocation " << nth;
        EXPECT_EQ(vxArrayDimensions(result.array.get())[0], result.count < 2 ? result.count : 5001);
        kept |= result.count == 1;
    }
    EXPECT_TRUE(kept);
}

// The encoding of an emptied file is not guessed from the digits that were written to it first.
TEST(Print, ChoosesTheEncodingOfAnEmptyFileAtOnce) {
    const TempFile content;
    auto file = openFile(content.path(), {"w", "n", ""});
    const ArrayPtr number = makeScalar(123);
    const vxArray* arrays[] = {number.get()};
    print(*file, u"%d", arrays);
    EXPECT_EQ(content.content(), "123");
    print(*file, u"\u20AC", {});
    EXPECT_EQ(content.content(), "123\xE2\x82\xAC");
}

// What the other end of a terminal sees of a transfer that goes on until there is something, or for
// `patience`.
std::string shownOn(int terminal, int reader, ProgressLine::Delay delay, int patience) {
    const TempFile content(std::string(3 << 20, 'x'));
    const FileHandle file(std::fopen(content.path().c_str(), "r"));
    fseeko(file.get(), 1 << 20, SEEK_SET);
    pollfd something = {reader, POLLIN, 0};
    {
        const ProgressLine progress(fileno(file.get()), "reading x", terminal, delay);
        poll(&something, 1, patience);
    }
    std::string shown;
    char byte = 0;
    while (poll(&something, 1, 100) > 0 && ::read(reader, &byte, 1) == 1)
        shown += byte;
    return shown;
}

TEST(ProgressLine, IsForTerminalsAndLongTransfers) {
    using namespace std::chrono_literals;
    const int master = posix_openpt(O_RDWR | O_NOCTTY);
    if (master < 0) GTEST_SKIP() << "no pseudo-terminals";
    grantpt(master);
    unlockpt(master);
    const int terminal = ::open(ptsname(master), O_RDWR | O_NOCTTY);
    ASSERT_GE(terminal, 0);
    const std::string shown = shownOn(terminal, master, 1ms, 10000);
    EXPECT_TRUE(shown.starts_with("\r\x1B[Kreading x: 1.0 MiB of 3.0 MiB\r\x1B[K")) << shown;
    EXPECT_TRUE(shown.ends_with("\r\x1B[K")) << shown;
    EXPECT_EQ(shownOn(terminal, master, 1h, 50), "");
    int ends[2];
    ASSERT_EQ(pipe(ends), 0);
    EXPECT_EQ(shownOn(ends[1], ends[0], 1ms, 50), "");
    for (const int descriptor : {terminal, master, ends[0], ends[1]})
        ::close(descriptor);
}

}  // namespace
}  // namespace Orvandeil::FileIO::embedded
