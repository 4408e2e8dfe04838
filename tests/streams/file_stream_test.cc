#include "fileio/streams/file_stream.h"

#include "embedded/services/charset.h"
#include "embedded/services/messages.h"
#include "fileio/constants.h"
#include "fileio/errors/code_list.h"
#include "tests/support/test_files.h"

#include <algorithm>
#include <cerrno>
#include <climits>

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

// Elements within a piece, up to its end and across, then reads up to the end of the file and past.
TEST(FileStream, WritesAndReadsWholeElementsAcrossPieces) {
    for (const unsigned long size : {1UL, 2UL, 3UL, piece + 5}) {
        for (const unsigned long count :
             {0UL, 1UL, piece / size, piece / size + 1, 2 * piece / size + 3}) {
            SCOPED_TRACE(std::to_string(count) + " of " + std::to_string(size));
            const TempFile file;
            const std::string bytes = pattern(count * size) + "12|x";
            OpenedFile output(file.path(), "w");
            EXPECT_EQ(output.stream.PutNElements(count, bytes.data(), size), count);
            EXPECT_EQ(output.stream.printf("%d|%s", 12, "x"), 4);
            EXPECT_EQ(output.stream.getBytesWritten(), bytes.size());
            EXPECT_EQ(output.stream.flush(), 0);
            ASSERT_EQ(file.content(), bytes);
            for (const unsigned long wanted : {count, count + 5}) {
                OpenedFile input(file.path());
                std::string buffer(wanted * size, '\0');
                errno = ENOTTY;
                const unsigned long got = input.stream.GetNElements(wanted, buffer.data(), size);
                const unsigned long taken = std::min(wanted * size, bytes.size());
                ASSERT_EQ(got, taken / size);
                EXPECT_EQ(buffer.substr(0, taken), bytes.substr(0, taken));
                EXPECT_EQ(input.position(), static_cast<long>(taken));
                EXPECT_EQ(input.stream.EndOfData(), wanted * size > bytes.size());
                EXPECT_EQ(input.stream.getErrorCode(), 0);
                if (got == 0) continue;
                // The byte at the index of the last element, whatever an element is.
                EXPECT_TRUE(input.stream.Rewind(1));
                EXPECT_EQ(input.read(1), buffer.substr(got - 1, 1));
            }
        }
    }
}

TEST(FileStream, KeepsTheCauseOfAFailure) {
    FaultyFile faulty{.bytes = "abcdef", .failingRead = 3, .error = EIO};
    OpenedFile opened(faulty.open("r"), "r");
    char buffer[8];
    EXPECT_EQ(opened.read(2), "ab");
    EXPECT_EQ(opened.stream.GetNElements(2, buffer, 2), 0u);
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
    opened.stream.clearError();
    std::setvbuf(opened.file, nullptr, _IONBF, 0);
    EXPECT_LT(opened.stream.PutNElements(2 * piece, pattern(2 * piece).data(), 1), 2 * piece);
    EXPECT_EQ(opened.stream.getErrorCode(), ENOSPC);
    opened.stream.clearError();
    EXPECT_LT(opened.stream.printf("%d", 1), 0);
    EXPECT_EQ(opened.stream.getErrorCode(), ENOSPC);
    EXPECT_EQ(opened.stream.getBytesWritten(), 1u);
}

TEST(FileStream, Rewinds) {
    const std::string content = "a\377c";
    const TempFile file(content);
    for (const unsigned long count : {0UL, 1UL, 2UL, 3UL, 9UL}) {
        const unsigned long taken = std::min(count, 3UL);
        for (unsigned long back = 0; back <= taken; ++back) {
            OpenedFile opened(file.path());
            opened.read(count);
            EXPECT_TRUE(opened.stream.Rewind(back));
            EXPECT_FALSE(opened.stream.EndOfData());
            EXPECT_EQ(opened.read(9), content.substr(taken - back)) << count << ", " << back;
        }
    }
}

TEST(FileStream, PushesBytesBackIntoAPipe) {
    const std::string content = std::string("abcdefghi\xFFj") + '\0';
    FaultyFile pipe{.bytes = content, .failingSeek = 1, .error = ESPIPE};
    OpenedFile opened(pipe.open("r", 99), "r");
    const auto goesBack = [&](unsigned long count) { return opened.stream.Rewind(count); };
    EXPECT_EQ(opened.read(1), "a");
    EXPECT_TRUE(goesBack(1) && !goesBack(1));  // nothing is left to push back
    EXPECT_EQ(opened.stream.getErrorCode(), ESPIPE);
    EXPECT_EQ(opened.read(10), content.substr(0, 10));
    EXPECT_TRUE(!goesBack(9) && goesBack(1) && goesBack(7));
    EXPECT_EQ(opened.read(99), content.substr(2));
    EXPECT_TRUE(goesBack(1) && !opened.stream.EndOfData());
    char block[5];
    EXPECT_EQ(opened.stream.GetNElements(5, block, 1), 1u);
    EXPECT_EQ(opened.stream.GetNElements(5, block, 0), 0u);
    EXPECT_TRUE(goesBack(3));
    EXPECT_EQ(opened.read(99), content.substr(9));
    long position = 7;
    EXPECT_NE(opened.stream.getPosition(position), 0);
    EXPECT_EQ(position, 7);
}

TEST(FileStream, CollectsIntoBuffers) {
    for (const unsigned long fileBytes :
         {0UL, 3UL, 5UL, piece - 1, piece, piece + 1, 4 * piece + 3}) {
        const TempFile file(pattern(fileBytes));
        const auto openPipe = [&] {
            return popen(("cat " + file.path()).c_str(), "r");
        };  // no size, no position
        const auto openFile = [&] { return std::fopen(file.path().c_str(), "r"); };
        for (const unsigned long count : {2UL, piece, 3 * piece, (1UL << 48) - 1, ULONG_MAX}) {
            for (std::FILE* source : {openFile(), openPipe()}) {
                OpenedFile opened(source, "r");
                OutputBuffer buffer(vxUINT16_CLASS, 0, 0, 0);
                const unsigned long got = count == ULONG_MAX
                                              ? opened.stream.GetNElements(buffer, 2)
                                              : opened.stream.GetNElements(count, buffer, 2);
                ASSERT_EQ(got, std::min(count, fileBytes / 2));
                ASSERT_EQ(buffer.GetSize(), got);
                EXPECT_EQ(opened.stream.EndOfData(), count > fileBytes / 2);
                const boost::shared_ptr<void> block = buffer.Transfer();
                EXPECT_EQ(std::string(static_cast<const char*>(block.get()), 2 * got),
                          pattern(2 * got));
            }
        }
    }
}

// In a file of "abc". To look at the byte asks for the position, sets it, reads and sets it again.
TEST(FileStream, CurrentByte) {
    const struct {
        const char* mode;
        long position;
        int byte, code;  // 'x': not set
        int failingSeek, error;
    } rows[] = {{"r", 1, 'x', code::IsOpenWrite, 0, 0},
                {"a", 1, 'x', code::IsOpenWrite, 0, 0},
                {"r+", 1, 'b', 0, 0, 0},
                {"r+", 3, 'x', code::ReadFailed, 0, 0},
                {"a+", 0, 'a', 0, 0, 0},
                {"w", 0, 0, 0, 0, 0},
                {"W+", 0, 0, 0, 0, 0},
                {"r+", 0, 'x', ESPIPE, 1, ESPIPE},
                {"r+", 0, 'x', code::FseekFailed, 2, 0},
                {"r+", 0, 'a', code::FseekFailedNegOne, 3, EIO}};
    for (const auto& row : rows) {
        SCOPED_TRACE(row.mode);
        FaultyFile file{.bytes = "abc"};
        OpenedFile opened(file.open("r+"), row.mode);
        ASSERT_EQ(opened.stream.setPosition(row.position), 0);
        file.seeks = 0;
        file.failingSeek = row.failingSeek;
        file.error = row.error;
        unsigned char byte = 'x';
        EXPECT_EQ(opened.stream.GetCurrentByteInStream(&byte), row.code != 0);
        EXPECT_EQ(byte, row.byte);
        EXPECT_EQ(opened.stream.getErrorCode(), row.code);
        file.failingSeek = 0;
        EXPECT_EQ(opened.position(), row.failingSeek == 3 ? 1 : row.position);
    }
}

TEST(FileStream, TellsAboutTheFile) {
    const TempFile file("abc");
    OpenedFile opened(file.path());
    long size = 7;
    EXPECT_TRUE(opened.stream.getFileSize(size));
    EXPECT_EQ(size, 3);
    EXPECT_FALSE(opened.stream.isScreen() || opened.stream.needsBufferSize());
    for (const bool isLast : {false, true}) {
        opened.read(isLast ? 1 : 2);
        opened.stream.checkForEndOfFile();
        EXPECT_EQ(opened.stream.EndOfData(), isLast);
    }
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

// The converter makes two units of the last two bytes, of which one is not taken.
TEST(FileStream, ForgetsWhatWasNotReadWhenItIsPositioned) {
    const TempFile file("a\x81\x30\x81 5");
    OpenedFile opened(file.path(), "r", "GB18030");
    std::u16string units;
    for (const int taken : {2, 3, 2}) {
        opened.stream.GetNCodePoints(units, static_cast<unsigned long>(taken), nullptr);
        EXPECT_EQ(units.substr(0, 2), u"a\uFFFD");
        opened.stream.giveBack(units.back(), 0);
        EXPECT_EQ(opened.stream.setPosition(0), 0);
    }
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
    fileStream onStandardInput(stdin, "latin2", warned.permission, u"");
    ASSERT_EQ(recorder.identifiers(), std::vector<std::string>{"KESTRA:iofun:UnsupportedEncoding"});
    EXPECT_EQ(recorder.warnings()[0].GetArguments(), std::vector<std::string>{"ISO-8859-2"});
    EXPECT_EQ(warned.read(9), "abc");
    onStandardInput.CheckStreamEncoding();
    EXPECT_EQ(recorder.warnings().size(), 2u);
}

}  // namespace
}  // namespace Orvandeil::FileIO
