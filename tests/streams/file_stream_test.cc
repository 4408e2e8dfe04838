#include "fileio/streams/file_stream.h"

#include "embedded/services/charset.h"
#include "embedded/services/messages.h"
#include "fileio/constants.h"
#include "fileio/errors/code_list.h"
#include "fileio/streams/carry_byte.h"
#include "tests/support/test_files.h"

#include <algorithm>
#include <cerrno>
#include <climits>
#include <cstring>
#include <unistd.h>

#include <gtest/gtest.h>

namespace Orvandeil::FileIO {
namespace {

using support::FaultyFile;
using support::OpenedFile;
using support::TempFile;

constexpr unsigned long piece = constants::transferPieceBytes;

// Bytes that tell their place and can all be pushed back.
std::string pattern(unsigned long count) {
    std::string bytes(count, '\0');
    for (unsigned long i = 0; i < count; ++i)
        bytes[i] = static_cast<char>(1 + i * 37 % 251);
    return bytes;
}

TEST(FileStream, ReadsWholeElementsAcrossPieces) {
    const struct {
        int line;
        unsigned long fileBytes, count, elementSize;
    } rows[] = {
        {__LINE__, 0, 1, 1},
        {__LINE__, 0, 3, 2},
        {__LINE__, 12, 3, 4},
        {__LINE__, 5, 4, 2},
        {__LINE__, 9, 0, 2},
        {__LINE__, 9, 3, 0},
        {__LINE__, piece, piece + 1, 1},
        {__LINE__, piece + 1, piece, 1},
        {__LINE__, 3 * piece + 2, piece + 2, 3},
        {__LINE__, 3 * piece + 20, 4, piece + 5},
    };
    for (const auto& row : rows) {
        const TempFile file(pattern(row.fileBytes));
        OpenedFile opened(file.path());
        std::string buffer(row.count * row.elementSize, '\0');
        errno = ENOTTY;
        const unsigned long got =
            opened.stream.GetNElements(row.count, buffer.data(), row.elementSize);

        const unsigned long wanted = row.count * row.elementSize;
        const unsigned long taken = std::min(wanted, row.fileBytes);
        ASSERT_EQ(got, row.elementSize == 0 ? 0 : taken / row.elementSize) << "line " << row.line;
        EXPECT_EQ(buffer.substr(0, taken), pattern(taken)) << "line " << row.line;
        EXPECT_EQ(opened.position(), static_cast<long>(taken)) << "line " << row.line;
        EXPECT_EQ(opened.stream.EndOfData(), wanted > row.fileBytes) << "line " << row.line;
        EXPECT_EQ(opened.stream.getErrorCode(), 0) << "line " << row.line;
        if (got == 0) continue;
        // The byte at the index of the last element, whatever an element is.
        EXPECT_TRUE(opened.stream.Rewind(1));
        EXPECT_EQ(opened.read(1), buffer.substr(got - 1, 1)) << "line " << row.line;
    }
}

TEST(FileStream, WritesWholeElementsAcrossPieces) {
    const unsigned long sizes[] = {1, 2, 3, piece + 5};
    for (const unsigned long size : sizes) {
        for (const unsigned long count :
             {0UL, 1UL, piece / size, piece / size + 1, 2 * piece / size + 3}) {
            const TempFile file;
            const std::string bytes = pattern(count * size);
            OpenedFile opened(file.path(), "w");
            EXPECT_EQ(opened.stream.PutNElements(count, bytes.data(), size), count);
            EXPECT_EQ(opened.stream.printf("%d|%s", 12, "x"), 4);
            EXPECT_EQ(opened.stream.getBytesWritten(), count * size + 4);
            EXPECT_EQ(opened.stream.flush(), 0);
            EXPECT_EQ(file.content(), bytes + "12|x") << count << " of " << size;
        }
    }
}

TEST(FileStream, KeepsTheCauseOfAFailure) {
    FaultyFile faulty{.bytes = "abcdef", .failingRead = 3, .error = EIO};
    OpenedFile opened(faulty.open("r"), "r");
    char buffer[8];
    // Two reads of the file bring one byte each, an element of two bytes needs a third and fourth.
    EXPECT_EQ(opened.read(2), "ab");
    EXPECT_EQ(opened.stream.GetNElements(2, buffer, 2), 0u);
    EXPECT_EQ(opened.stream.getErrorCode(), EIO);
    faulty.failingRead = 0;
    std::clearerr(opened.file);
    EXPECT_EQ(opened.read(1), "c");
    EXPECT_EQ(opened.stream.getErrorCode(), EIO);
    opened.stream.clearError();
    EXPECT_EQ(opened.stream.getErrorCode(), 0);

    faulty.failingRead = 1;
    faulty.error = 0;
    EXPECT_EQ(opened.stream.GetNElements(1, buffer, 1), 0u);
    EXPECT_EQ(opened.stream.getErrorCode(), -1);  // only the indicator tells
}

TEST(FileStream, FullDevice) {
    OpenedFile opened(std::fopen("/dev/full", "w"), "w");
    EXPECT_EQ(opened.stream.PutNElements(1, "a", 1), 1u);
    EXPECT_EQ(opened.stream.flush(), -1);
    EXPECT_EQ(opened.stream.getErrorCode(), ENOSPC);
    EXPECT_EQ(opened.stream.getBytesWritten(), 1u);

    opened.stream.clearError();
    std::setvbuf(opened.file, nullptr, _IONBF, 0);
    const std::string bytes = pattern(2 * piece);
    EXPECT_LT(opened.stream.PutNElements(bytes.size(), bytes.data(), 1), bytes.size());
    EXPECT_EQ(opened.stream.getErrorCode(), ENOSPC);
    opened.stream.clearError();
    EXPECT_LT(opened.stream.printf("%d", 1), 0);
    EXPECT_EQ(opened.stream.getErrorCode(), ENOSPC);
    EXPECT_EQ(opened.stream.getBytesWritten(), 1u);
}

TEST(FileStream, Rewinds) {
    const struct {
        int line;
        const char* content;
        unsigned long read, back;
        const char* rest;
    } rows[] = {
        {__LINE__, "abc", 2, 1, "bc"},       {__LINE__, "abc", 3, 1, "c"},
        {__LINE__, "abc", 3, 3, "abc"},      {__LINE__, "abc", 2, 0, "c"},
        {__LINE__, "abc", 9, 0, ""},         {__LINE__, "abc", 9, 2, "bc"},
        {__LINE__, "a\377c", 2, 1, "\377c"},
    };
    for (const auto& row : rows) {
        const TempFile file(row.content);
        OpenedFile opened(file.path());
        opened.read(row.read);
        EXPECT_TRUE(opened.stream.Rewind(row.back)) << "line " << row.line;
        EXPECT_FALSE(opened.stream.EndOfData()) << "line " << row.line;
        EXPECT_EQ(opened.read(9), row.rest) << "line " << row.line;
    }
    const TempFile file("abc");
    OpenedFile opened(file.path());
    opened.read(2);
    for (const unsigned long tooFar : {3UL, static_cast<unsigned long>(LONG_MAX), ULONG_MAX}) {
        EXPECT_FALSE(opened.stream.Rewind(tooFar));
        EXPECT_EQ(opened.stream.getErrorCode(), EINVAL);
        EXPECT_EQ(opened.position(), 2);
    }
}

TEST(FileStream, PushesBytesBackIntoAPipe) {
    const std::string content = std::string("abcdefghi\xFFj") + '\0';
    int ends[2];
    ASSERT_EQ(pipe(ends), 0);
    ASSERT_EQ(write(ends[1], content.data(), content.size()), static_cast<ssize_t>(content.size()));
    close(ends[1]);
    OpenedFile opened(fdopen(ends[0], "r"), "r");
    EXPECT_EQ(opened.read(1), "a");
    EXPECT_TRUE(opened.stream.Rewind(1));
    // There is nothing left to push back.
    EXPECT_FALSE(opened.stream.Rewind(1));
    EXPECT_EQ(opened.stream.getErrorCode(), ESPIPE);
    EXPECT_EQ(opened.read(10), content.substr(0, 10));
    EXPECT_FALSE(opened.stream.Rewind(9));
    EXPECT_TRUE(opened.stream.Rewind(1));
    EXPECT_TRUE(opened.stream.Rewind(7));
    EXPECT_EQ(opened.read(99), content.substr(2));
    EXPECT_TRUE(opened.stream.Rewind(1));
    EXPECT_FALSE(opened.stream.EndOfData());
    char block[5];
    EXPECT_EQ(opened.stream.GetNElements(5, block, 1), 1u);
    EXPECT_TRUE(opened.stream.Rewind(3));
    EXPECT_EQ(opened.read(99), content.substr(9));
    long position = 7;
    EXPECT_NE(opened.stream.getPosition(position), 0);
    EXPECT_EQ(position, 7);
}

TEST(FileStream, CollectsIntoBuffers) {
    constexpr unsigned long hugeCount = (1UL << 48) - 1;
    const unsigned long sizes[] = {0, 3, 5, piece - 1, piece, piece + 1, 4 * piece + 3};
    for (const unsigned long fileBytes : sizes) {
        for (const unsigned long count : {2UL, piece, 3 * piece, hugeCount, ULONG_MAX}) {
            const TempFile file(pattern(fileBytes));
            // A process substitution of the shell: no size, no position.
            for (std::FILE* source : {std::fopen(file.path().c_str(), "r"),
                                      popen(("cat " + file.path()).c_str(), "r")}) {
                OpenedFile opened(source, "r");
                OutputBuffer buffer(vxUINT16_CLASS, 0, 0, 0);
                const unsigned long got = count == ULONG_MAX
                                              ? opened.stream.GetNElements(buffer, 2)
                                              : opened.stream.GetNElements(count, buffer, 2);
                const unsigned long expected = std::min(count, fileBytes / 2);
                ASSERT_EQ(got, expected);
                ASSERT_EQ(buffer.GetSize(), expected);
                EXPECT_EQ(opened.stream.EndOfData(), count > fileBytes / 2);
                const boost::shared_ptr<void> block = buffer.Transfer();
                if (expected == 0) continue;
                EXPECT_EQ(std::memcmp(block.get(), pattern(2 * expected).data(), 2 * expected), 0);
            }
        }
    }
}

TEST(FileStream, CurrentByteByPermission) {
    const struct {
        int line;
        const char* mode;
        long position;
        int result, byte, code;
    } rows[] = {
        {__LINE__, "r", 1, 1, 'x', code::IsOpenWrite},
        {__LINE__, "a", 1, 1, 'x', code::IsOpenWrite},
        {__LINE__, "r+", 1, 0, 'b', 0},
        {__LINE__, "r+", 3, 1, 'x', code::ReadFailed},
        {__LINE__, "a+", 0, 0, 'a', 0},
        {__LINE__, "w", 0, 0, 0, 0},
        {__LINE__, "W+", 0, 0, 0, 0},
    };
    for (const auto& row : rows) {
        const TempFile file("abc");
        OpenedFile opened(file.path(), row.mode);
        ASSERT_EQ(opened.stream.setPosition(row.position), 0);
        unsigned char byte = 'x';
        EXPECT_EQ(opened.stream.GetCurrentByteInStream(&byte), row.result) << "line " << row.line;
        EXPECT_EQ(byte, row.byte) << "line " << row.line;
        EXPECT_EQ(opened.stream.getErrorCode(), row.code) << "line " << row.line;
        EXPECT_EQ(opened.position(), row.position) << "line " << row.line;
    }
}

// Asks for the position, sets it, reads and sets it again.
TEST(FileStream, CurrentByteWhenASeekFails) {
    const struct {
        int failingSeek, error, code;
    } rows[] = {{1, ESPIPE, ESPIPE}, {2, 0, code::FseekFailed}, {3, EIO, code::FseekFailedNegOne}};
    for (const auto& row : rows) {
        FaultyFile faulty{.bytes = "abc", .failingSeek = row.failingSeek, .error = row.error};
        OpenedFile opened(faulty.open("r+"), "r+");
        unsigned char byte = 0;
        EXPECT_EQ(opened.stream.GetCurrentByteInStream(&byte), 1);
        EXPECT_EQ(opened.stream.getErrorCode(), row.code);
    }
}

TEST(FileStream, TellsAboutTheFile) {
    const TempFile file("abc");
    OpenedFile opened(file.path());
    long size = 7;
    EXPECT_TRUE(opened.stream.getFileSize(size));
    EXPECT_EQ(size, 3);
    EXPECT_FALSE(opened.stream.isScreen());
    EXPECT_FALSE(opened.stream.needsBufferSize());
    opened.read(2);
    opened.stream.checkForEndOfFile();
    EXPECT_FALSE(opened.stream.EndOfData());
    opened.read(1);
    opened.stream.checkForEndOfFile();
    EXPECT_TRUE(opened.stream.EndOfData());
    EXPECT_EQ(opened.stream.setPosition(1), 0);
    EXPECT_EQ(opened.read(9), "bc");
    EXPECT_NE(opened.stream.setPosition(-1), 0);
    EXPECT_EQ(opened.stream.getErrorCode(), EINVAL);

    FaultyFile inMemory;
    OpenedFile without(inMemory.open("r"), "r");
    EXPECT_FALSE(without.stream.getFileSize(size));
    EXPECT_EQ(size, 0);
    EXPECT_EQ(without.stream.getErrorCode(), EBADF);
    EXPECT_FALSE(fileStream(nullptr, "", without.permission, u"").isFileOpen());
}

TEST(FileStream, WarnsOfUnsupportedEncodings) {
    const TempFile file("abc");
    const embedded::WithdrawnEncoding first("macintosh");
    const embedded::WithdrawnEncoding second("ISO-8859-2");
    embedded::WarningRecorder recorder;
    OpenedFile supported(file.path(), "r", "ISO-8859-1");
    OpenedFile silent(file.path(), "r", "macintosh");
    EXPECT_TRUE(recorder.warnings().empty());
    OpenedFile warned(file.path(), "r", "latin2");
    ASSERT_EQ(recorder.identifiers(), std::vector<std::string>{"KESTRA:iofun:UnsupportedEncoding"});
    EXPECT_EQ(recorder.warnings()[0].GetArguments(), std::vector<std::string>{"ISO-8859-2"});
    EXPECT_EQ(warned.read(9), "abc");

    fileStream onStandardInput(stdin, "latin2", warned.permission, u"");
    EXPECT_EQ(recorder.warnings().size(), 1u);
    onStandardInput.CheckStreamEncoding();
    EXPECT_EQ(recorder.warnings().size(), 2u);
}

}  // namespace
}  // namespace Orvandeil::FileIO
