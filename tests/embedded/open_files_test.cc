#include "embedded/builtins/file_table.h"
#include "embedded/builtins/positioning.h"
#include "embedded/builtins/print.h"
#include "embedded/builtins/progress_line.h"
#include "embedded/builtins/scan.h"
#include "embedded/builtins/spool.h"
#include "embedded/builtins/text_lines.h"
#include "embedded/services/memory.h"
#include "fileio/errors/code_list.h"
#include "tests/support/printing.h"
#include "tests/support/test_files.h"

#include <cerrno>
#include <cmath>
#include <cstdlib>
#include <fcntl.h>
#include <poll.h>
#include <string>
#include <unistd.h>
#include <vector>

#include <gtest/gtest.h>

namespace Orvandeil::FileIO::embedded {
namespace {

using fileio_tests::toUtf8;
using foundation::core::except::IMsgIDException;
using support::TempFile;

template <class Call>
int codeOf(Call call) {
    try {
        call();
    } catch (const CodeError& error) {
        return error.code;
    }
    return 0;
}

TEST(FileTable, KeepsFilesAtTheirAddresses) {
    const TempFile first("a");
    const TempFile second("b");
    FileTable table;
    const int one = table.open(first.path(), {});
    OpenFile* const address = &table.file(one);
    for (int i = 1; i < 20; ++i)
        EXPECT_EQ(table.open(second.path(), {}), one + i);
    EXPECT_EQ(&table.file(one), address);
    EXPECT_EQ(table.file(one).label, first.path());
    EXPECT_EQ(table.close(one), std::nullopt);
    EXPECT_EQ(codeOf([&] { table.file(one); }), EBADF);
    EXPECT_EQ(codeOf([&] { table.close(FileTable::standardInput); }), EBADF);
    EXPECT_EQ(table.open(second.path(), {"r+", "b", ""}), one);
    EXPECT_EQ(table.file(one).format.dataSizeType, 1);
    EXPECT_EQ(table.numbers().size(), 20u);
    EXPECT_EQ(tell(table.file(FileTable::console)), -1);
    EXPECT_EQ(codeOf([&] { seek(table.file(FileTable::console), 0, Origin::Begin); }),
              code::FseekFailed);
}

TEST(OpenFile, IsRefusedBeforeAnythingIsLost) {
    const TempFile file("content");
    const auto identifierOf = [&file](const OpenRequest& request) -> std::string {
        try {
            openFile(file.path(), request);
        } catch (const IMsgIDException& error) {
            return error.GetID();
        }
        return "";
    };
    EXPECT_EQ(identifierOf({"x", "middle", "nonsense"}), "KESTRA:legacy_two_part:badpermission_vx");
    EXPECT_EQ(identifierOf({"wr", "middle", "nonsense"}),
              "KESTRA:fopen:ConflictingExclusiveFileModes");
    EXPECT_EQ(identifierOf({"w", "middle", "nonsense"}), "KESTRA:legacy_two_part:badmachformat_vx");
    EXPECT_EQ(identifierOf({"w", "n", "nonsense"}), "KESTRA:iofun:InvalidEncoding");
    EXPECT_EQ(file.content(), "content");
    EXPECT_EQ(codeOf([] { openFile("/nowhere/at/all", {}); }), ENOENT);
    EXPECT_EQ(codeOf([] { openFile("/", {}); }), EISDIR);
}

TEST(Positioning, StaysWithinTheFile) {
    const TempFile content("0123456789");
    auto file = openFile(content.path(), {"r+", "n", ""});
    const struct {
        int line;
        double offset;
        Origin origin;
        int code;
        long position;
    } rows[] = {
        {__LINE__, 4, Origin::Begin, 0, 4},
        {__LINE__, -3, Origin::Current, 0, 1},
        {__LINE__, -2, Origin::Current, code::BadOffsetBeforeBegin, 1},
        {__LINE__, 10, Origin::Begin, 0, 10},
        {__LINE__, 11, Origin::Begin, code::BadOffsetAfterEnd, 10},
        {__LINE__, -10, Origin::End, 0, 0},
        {__LINE__, -11, Origin::End, code::BadOffsetBeforeBegin, 0},
        {__LINE__, 1, Origin::End, code::BadOffsetAfterEnd, 0},
        {__LINE__, NAN, Origin::Begin, code::BadOffsetNaN, 0},
        {__LINE__, 1.5, Origin::Begin, code::BadOffsetInt, 0},
        {__LINE__, INFINITY, Origin::Begin, code::BadOffsetAfterEnd, 0},
        {__LINE__, -INFINITY, Origin::Begin, code::BadOffsetBeforeBegin, 0},
        {__LINE__, 9223372036854774784.0, Origin::End, code::BadOffsetAfterEnd, 0},
        {__LINE__, 1e300, Origin::Begin, code::BadOffsetAfterEnd, 0},
    };
    for (const auto& row : rows) {
        EXPECT_EQ(codeOf([&] { seek(*file, row.offset, row.origin); }), row.code)
            << "line " << row.line;
        EXPECT_EQ(tell(*file), row.position) << "line " << row.line;
    }
    // What is only in the buffer counts, too.
    file = openFile(content.path(), {"W+", "n", ""});
    EXPECT_FALSE(print(*file, u"12345", {}));
    seek(*file, 5, Origin::Begin);
    EXPECT_EQ(codeOf([&] { seek(*file, 6, Origin::Begin); }), code::BadOffsetAfterEnd);
    rewind(*file);
    EXPECT_EQ(toUtf8(readLine(*file)->text), "12345");
    EXPECT_TRUE(endOfFile(*file));
    EXPECT_EQ(errorOf(*file).code, 0);
    EXPECT_EQ(errorOf(*file).message, u"");
    rewind(*file);
    EXPECT_FALSE(endOfFile(*file));
}

TEST(Lines, EndAtTerminatorsAndLimits) {
    const struct {
        int line;
        const char* content;
        long limit;
        Terminators terminators;
        const char* expected;  // each line with its result and a bar
    } rows[] = {
        {__LINE__, "a\r\nb\rc\n\nd", anyLength, Terminators::Dropped, "a2|b1|c1|1|d0|"},
        {__LINE__, "a\r\nb\r", anyLength, Terminators::Kept, "a\r\n2|b\r1|"},
        {__LINE__, "ab\r\nc", 3, Terminators::Dropped, "ab1|1|c0|"},
        {__LINE__, "abcde", 2, Terminators::Dropped, "ab0|cd0|e0|"},
        {__LINE__, "", anyLength, Terminators::Dropped, ""},
    };
    for (const auto& row : rows) {
        const TempFile content(row.content);
        auto file = openFile(content.path(), {});
        std::string seen;
        while (const auto line = readLine(*file, row.limit, row.terminators))
            seen += toUtf8(line->text) + std::to_string(line->result) + '|';
        EXPECT_EQ(seen, row.expected) << "line " << row.line;
    }
    const TempFile content;
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

TEST(Print, WritesToFilesAndTellsFailures) {
    const TempFile content;
    auto file = openFile(content.path(), {"w", "n", "UTF-16LE"});
    const ArrayPtr two = makeDoubles(1, 2, {1, 2});
    const vxArray* arrays[] = {two.get()};
    // Text is encoded; numbers are the standard library's bytes.
    EXPECT_FALSE(print(*file, u"%d\u20AC%s", arrays));
    EXPECT_EQ(content.content(), std::string("1\xAC\x20\x02\0", 5));
    EXPECT_EQ(print(*file, u"a%q", {})->code, code::InvalidFormat);
    closeFile(std::move(file));
    auto input = openFile(content.path(), {});
    EXPECT_EQ(codeOf([&] { print(*input, u"x", {}); }), code::IsOpenRead);
    auto full = openFile("/dev/full", {"w", "n", ""});
    EXPECT_EQ(print(*full, u"x", {})->code, ENOSPC);
}

// The encoding of an emptied file is not guessed from the digits that were written to it first.
TEST(Print, ChoosesTheEncodingOfAnEmptyFileAtOnce) {
    const TempFile content;
    auto file = openFile(content.path(), {"w", "n", ""});
    const ArrayPtr number = makeScalar(123);
    const vxArray* arrays[] = {number.get()};
    print(*file, u"%d", arrays);
    flushFile(*file);
    print(*file, u"\u20AC", {});
    closeFile(std::move(file));
    EXPECT_EQ(content.content(), "123\xE2\x82\xAC");
}

TEST(Spool, HoldsAllOfAPipe) {
    const TempFile content(std::string(3000000, 'x') + "end");
    std::FILE* const pipe = popen(("cat " + content.path()).c_str(), "r");
    const FileHandle copy = spool(pipe, "pipe");
    pclose(pipe);
    EXPECT_EQ(ftello(copy.get()), 0);
    EXPECT_EQ(fseeko(copy.get(), -3, SEEK_END), 0);
    char end[4] = {};
    EXPECT_EQ(std::fread(end, 1, 3, copy.get()), 3u);
    EXPECT_STREQ(end, "end");
    EXPECT_EQ(ftello(copy.get()), 3000003);
}

// What the other end of a terminal sees of a transfer that goes on until there is something, or for
// `patience`.
std::string shownOn(int terminal, int reader, ProgressLine::Delay delay, int patience) {
    const TempFile content(std::string(3 << 20, 'x'));
    std::FILE* const file = std::fopen(content.path().c_str(), "r");
    fseeko(file, 1 << 20, SEEK_SET);
    pollfd something = {reader, POLLIN, 0};
    {
        const ProgressLine progress(fileno(file), "reading x", terminal, delay);
        poll(&something, 1, patience);
    }
    std::fclose(file);
    // A terminal hands on with a delay what was written.
    std::string shown;
    for (char byte = 0; poll(&something, 1, 100) > 0 && ::read(reader, &byte, 1) == 1;)
        shown += byte;
    return shown;
}

TEST(ProgressLine, IsForTerminalsAndLongTransfers) {
    constexpr ProgressLine::Delay soon{1};
    constexpr ProgressLine::Delay late = std::chrono::hours(1);
    const int master = posix_openpt(O_RDWR | O_NOCTTY);
    if (master < 0) GTEST_SKIP() << "no pseudo-terminals";
    grantpt(master);
    unlockpt(master);
    const int terminal = ::open(ptsname(master), O_RDWR | O_NOCTTY);
    ASSERT_GE(terminal, 0);
    const std::string shown = shownOn(terminal, master, soon, 10000);
    EXPECT_TRUE(shown.starts_with("\r\x1B[Kreading x: 1.0 MiB of 3.0 MiB\r\x1B[K")) << shown;
    EXPECT_TRUE(shown.ends_with("\r\x1B[K")) << shown;
    EXPECT_EQ(shownOn(terminal, master, late, 50), "");
    ::close(terminal);
    ::close(master);
    int ends[2];
    ASSERT_EQ(pipe(ends), 0);
    EXPECT_EQ(shownOn(ends[1], ends[0], soon, 50), "");
    ::close(ends[0]);
    ::close(ends[1]);
}

}  // namespace
}  // namespace Orvandeil::FileIO::embedded
