#include "tests/oracle/scan_oracle.h"
#include "tests/support/test_files.h"

#include <cerrno>

#include <gtest/gtest.h>

namespace {

using namespace oracle;
using Orvandeil::FileIO::FilePermission;
using Orvandeil::FileIO::fileStream;

// All that shows of a stream between two operations.
std::string describe(std::FILE* file, int errorCode, const Outcome& out) {
    char text[80];
    std::snprintf(text, sizeof text, " code %d at %ld eof %d error %d", errorCode, std::ftell(file),
                  std::feof(file) != 0, std::ferror(file) != 0);
    return out.describe() + text;
}

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
    int errorCode = 0;
    for (std::size_t i = 0; i < steps; ++i) {
        const Operation operation = fields.operation();
        const long width = fields.width();
        const int status = operation == Float ? fields.entryStatus() : INT_MAX;
        const Outcome found = scanWith(stream, operation, width, status, false);
        const Outcome wanted = scanByFscanf(second, operation, width, status, errorCode);
        const std::string foundState = describe(first, stream.getErrorCode(), found);
        const std::string wantedState = describe(second, errorCode, wanted);
        EXPECT_EQ(foundState, wantedState) << "operation " << operation << " width " << width
                                           << " entry " << status << " step " << i;
        if (foundState != wantedState) return false;
        // Read on behind what is no number of any kind.
        if (found.status != INT_MAX && std::getc(first) != std::getc(second)) return false;
    }
    EXPECT_EQ(readRest(first), readRest(second));
    return !testing::Test::HasFailure();
}

// A file in memory behind a small buffer, able to seek or like a pipe.
struct EdgeFile {
    EdgeFile(const std::string& text, bool canSeek, std::size_t bufferSize)
        : memory{.bytes = text, .failingSeek = canSeek ? 0 : 1, .error = ESPIPE},
          buffer(bufferSize, '\0'),
          file(memory.open("r")) {
        std::setvbuf(file, buffer.data(), _IOFBF, buffer.size());
    }
    EdgeFile(const EdgeFile&) = delete;
    EdgeFile& operator=(const EdgeFile&) = delete;
    ~EdgeFile() { std::fclose(file); }

    support::FaultyFile memory;
    std::string buffer;
    std::FILE* file;
};

TEST(FileScanOracle, FieldsAtEveryEdgeOfTheBuffer) {
    Fields fields(7);
    for (int trial = 0; trial < 150000; ++trial) {
        const std::string text = fields.text(1 + fields.below(12));
        const bool canSeek = fields.below(2) == 0;
        const std::size_t bufferSize = 1 + fields.below(40);
        const EdgeFile first(text, canSeek, bufferSize), second(text, canSeek, bufferSize);
        ASSERT_TRUE(agree(first.file, second.file, fields, 1 + fields.below(4)))
            << "trial " << trial << " text " << testing::PrintToString(text);
    }
}

TEST(FileScanOracle, RegularFiles) {
    Fields fields(11);
    for (int trial = 0; trial < 20; ++trial) {
        const support::TempFile file(fields.text(4000));
        const support::OpenedFile first(file.path()), second(file.path());
        EXPECT_TRUE(agree(first.file, second.file, fields, 3000)) << "trial " << trial;
    }
}

}  // namespace
