#include "fileio/attributes/file_permission.h"
#include "fileio/streams/file_stream.h"
#include "tests/oracle/fscanf_reference.h"
#include "tests/support/test_files.h"

#include <cerrno>
#include <cstring>
#include <random>
#include <unistd.h>

#include <gtest/gtest.h>

namespace {

using namespace oracle;
using namespace std::string_literals;
using Orvandeil::FileIO::FilePermission;
using Orvandeil::FileIO::fileStream;

Outcome scanWith(fileStream& stream, Operation operation, long width, int status) {
    Outcome out;
    out.status = operation == Float ? status : INT_MAX;
    bool flag = false;
    switch (operation) {
        case Integer:
            out.bits = static_cast<unsigned long>(stream.scanInteger(width, out.status));
            break;
        case CouldBeHex:
            out.bits = static_cast<unsigned long>(stream.scanIntegerCouldBeHex(width, out.status));
            break;
        case Unsigned:
            out.bits = stream.scanUnsignedInteger(width, out.status, flag);
            break;
        case Octal:
            out.bits = stream.scanOctal(width, out.status, flag);
            break;
        case Hex:
            out.bits = stream.scanHex(width, out.status, flag);
            break;
        default: {
            const double value = stream.scanFloat(width, out.status);
            std::memcpy(&out.bits, &value, sizeof value);
        }
    }
    out.flag = flag;
    return out;
}

// All that shows of a stream between two operations.
std::string describe(std::FILE* file, int errorCode, const Outcome& out) {
    char text[200];
    std::snprintf(text, sizeof text, "value %#lx status %d flag %d code %d at %ld eof %d error %d",
                  out.bits, out.status, out.flag, errorCode, std::ftell(file), std::feof(file) != 0,
                  std::ferror(file) != 0);
    return text;
}

class Fields {
public:
    explicit Fields(unsigned seed) : random(seed) {}

    std::size_t below(std::size_t bound) {
        return std::uniform_int_distribution<std::size_t>(0, bound - 1)(random);
    }

    std::string text(std::size_t tokens) {
        static const std::string special[] = {"-0", "0x",  "-0x", "0X1", "inf", "-nan", "in",
                                              "na", "INF", "NaN", "1e+", "1e5", "1.",   ".5",
                                              "0b", "-.",  "e-",  " -",  "0x.", "+0"};
        static const std::string alphabet = " \t\n\0\xFF+-0017789aefinpx.,"s;
        std::string result;
        for (std::size_t i = 0; i < tokens; ++i) {
            switch (below(12)) {
                case 0:
                case 1:
                    result += special[below(std::size(special))];
                    break;
                case 2:
                    result += std::string(20 + below(41), "0179af"[below(6)]);
                    break;
                case 3:
                    result += std::to_string(random());
                    break;
                default:
                    result += alphabet[below(alphabet.size())];
            }
        }
        return result;
    }

    Operation operation() { return static_cast<Operation>(below(operationCount)); }
    long width() {
        static constexpr long special[] = {0, 999, 2147483647, 1L << 40, LONG_MAX};
        if (below(3) == 0) return -1;
        return below(8) == 0 ? special[below(std::size(special))]
                             : static_cast<long>(1 + below(30));
    }
    int entryStatus() { return below(8) == 0 ? static_cast<int>(below(2)) * 5 : INT_MAX; }

private:
    std::mt19937 random;
};

std::string readRest(std::FILE* file) {
    std::string rest;
    for (int byte = std::getc(file); byte != EOF; byte = std::getc(file))
        rest += static_cast<char>(byte);
    return rest;
}

// Runs the same operations on two files of the same content until `steps` are done; false when
// they differ.
bool agree(std::FILE* first, std::FILE* second, Fields& fields, std::size_t steps) {
    FilePermission permission;
    fileStream stream(first, "", permission, u"");
    FscanfReference reference(second);
    for (std::size_t i = 0; i < steps; ++i) {
        const Operation operation = fields.operation();
        const long width = fields.width();
        const int status = fields.entryStatus();
        const Outcome found = scanWith(stream, operation, width, status);
        const Outcome wanted = reference.scan(operation, width, status);
        const std::string foundState = describe(first, stream.getErrorCode(), found);
        const std::string wantedState = describe(second, reference.getErrorCode(), wanted);
        EXPECT_EQ(foundState, wantedState) << "operation " << operation << " width " << width
                                           << " entry " << status << " step " << i;
        if (foundState != wantedState) return false;
        // Read on behind what is no number of any kind.
        if (found.status != INT_MAX && std::getc(first) != std::getc(second)) return false;
    }
    const long position = std::ftell(first);
    const std::string left = readRest(first);
    EXPECT_EQ(left, readRest(second));
    if (position >= 0) {
        EXPECT_EQ(position + static_cast<long>(left.size()), std::ftell(first));
    }
    return !testing::Test::HasFailure();
}

bool agreeAndClose(std::FILE* (&files)[2], Fields& fields, std::size_t steps) {
    const bool same = agree(files[0], files[1], fields, steps);
    for (std::FILE* file : files)
        std::fclose(file);
    return same;
}

TEST(FileScanOracle, FieldsAtEveryEdgeOfTheBuffer) {
    Fields fields(7);
    for (int trial = 0; trial < 150000; ++trial) {
        const std::string text = fields.text(1 + fields.below(12));
        const bool canSeek = fields.below(2) == 0;
        std::string buffers[2];
        buffers[0].resize(1 + fields.below(40));
        buffers[1] = buffers[0];
        support::FaultyFile memory[2];
        std::FILE* files[2];
        for (std::size_t i = 0; i < 2; ++i) {
            memory[i].bytes = text;
            memory[i].failingSeek = canSeek ? 0 : 1;
            memory[i].error = ESPIPE;
            files[i] = memory[i].open("r");
            std::setvbuf(files[i], buffers[i].data(), _IOFBF, buffers[i].size());
        }
        ASSERT_TRUE(agreeAndClose(files, fields, 1 + fields.below(4)))
            << "trial " << trial << " text \"" << testing::PrintToString(text) << "\"";
    }
}

std::FILE* regularFile(const std::string& text) {
    std::FILE* file = std::tmpfile();
    EXPECT_EQ(std::fwrite(text.data(), 1, text.size(), file), text.size());
    std::rewind(file);
    return file;
}

std::FILE* filledPipe(const std::string& text) {
    int ends[2];
    EXPECT_EQ(pipe(ends), 0);
    EXPECT_EQ(write(ends[1], text.data(), text.size()), static_cast<ssize_t>(text.size()));
    close(ends[1]);
    return fdopen(ends[0], "r");
}

TEST(FileScanOracle, RegularFilesAndPipes) {
    Fields fields(11);
    for (int trial = 0; trial < 40; ++trial) {
        const std::string text = fields.text(4000);
        std::FILE* files[] = {trial % 2 == 0 ? regularFile(text) : filledPipe(text),
                              trial % 2 == 0 ? regularFile(text) : filledPipe(text)};
        ASSERT_TRUE(agreeAndClose(files, fields, 3000)) << "trial " << trial;
    }
}

}  // namespace
