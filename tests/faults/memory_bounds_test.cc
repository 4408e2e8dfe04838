#include "tests/support/test_files.h"

#include <cstddef>
#include <cstdio>
#include <fcntl.h>
#include <fstream>
#include <spawn.h>
#include <sstream>
#include <string>
#include <string_view>
#include <vector>

#include <gtest/gtest.h>
#include <sys/resource.h>
#include <sys/wait.h>

// What the program itself has in memory at most, beyond its result.
namespace {

using support::TempFile;

// The largest resident size in KiB of `fileio ARGUMENTS FILE`, which prints into nowhere.
long peakOf(const std::string& arguments, const std::string& file) {
    std::vector<std::string> words = {FILEIO_PROGRAM};
    std::istringstream text(arguments);
    for (std::string word; text >> word;)
        words.push_back(word);
    if (!file.empty()) words.push_back(file);
    std::vector<char*> argv;
    for (std::string& word : words)
        argv.push_back(word.data());
    argv.push_back(nullptr);
    posix_spawn_file_actions_t actions;
    posix_spawn_file_actions_init(&actions);
    posix_spawn_file_actions_addopen(&actions, 1, "/dev/null", O_WRONLY, 0);
    posix_spawn_file_actions_addopen(&actions, 2, "/dev/null", O_WRONLY, 0);
    pid_t child = 0;
    EXPECT_EQ(posix_spawn(&child, argv[0], &actions, nullptr, argv.data(), environ), 0);
    posix_spawn_file_actions_destroy(&actions);
    int status = 0;
    rusage usage = {};
    EXPECT_EQ(wait4(child, &status, 0, &usage), child);
    EXPECT_TRUE(WIFEXITED(status));
    return usage.ru_maxrss;
}

// A part of a text, and how often it stands in the file.
struct Input {
    std::string_view part;
    std::size_t count;
};

// Written piece by piece: what this process has in memory counts for its children.
void fill(const std::string& path, const Input& input) {
    std::ofstream file(path, std::ios::binary);
    for (std::size_t i = 0; i < input.count; ++i)
        file << input.part;
}

TEST(MemoryBounds, ResultAndLittleMore) {
#ifdef __SANITIZE_ADDRESS__
    GTEST_SKIP() << "the sanitizer needs memory of its own";
#endif
    constexpr long mebi = 1024;
    constexpr std::string_view line =
        "a line of eighty bytes, which end in a line feed, for lines and binary reading.\n";
    static_assert(line.size() == 80);
    const struct {
        int line;
        const char* arguments;
        Input input;
        long resultKiB;
        long moreKiB;
    } rows[] = {
#ifndef FILEIO_SMALL_CONSTANTS  // whose chunks each take more than they hold
        {__LINE__, "scan %d", {"12345\n", 3 * mebi * mebi}, 24 * mebi, 16 * mebi},
        {__LINE__, "scan %f", {"1.25 ", 3 * mebi * mebi}, 24 * mebi, 16 * mebi},
        {__LINE__, "scan %s", {"y", 12 * mebi * mebi}, 24 * mebi, 16 * mebi},
        {__LINE__, "scan --json %d", {"12345\n", 3 * mebi * mebi}, 24 * mebi, 16 * mebi},
        {__LINE__, "scan --json %s", {"y", 12 * mebi * mebi}, 24 * mebi, 16 * mebi},
        {__LINE__, "lines", {"y", 12 * mebi * mebi}, 24 * mebi, 16 * mebi},
        {__LINE__, "lines --json", {"y", 12 * mebi * mebi}, 24 * mebi, 16 * mebi},
#endif
        {__LINE__, "lines", {line, 300000}, 0, 16 * mebi},
        {__LINE__, "lines --json", {line, 300000}, 0, 16 * mebi},
        {__LINE__, "read --precision double --npy /dev/null", {line, 600000}, 47 * mebi, 4 * mebi},
#ifdef FILEIO_FAST_PATHS  // without them, the elements of the file lie beside the array
        {__LINE__,
         "read --precision int16=>double --npy /dev/null",
         {line, 150000},
         47 * mebi,
         4 * mebi},
#endif
        {__LINE__, "printf %.50000000f 1", {}, 0, 16 * mebi},
        {__LINE__, "printf %.50000000e 1", {}, 0, 16 * mebi},
        {__LINE__, "printf %50000000d|%-50000000s|%.50000000d 1 a 2", {}, 0, 16 * mebi},
    };
    const TempFile empty;
    const long baseline = peakOf("lines", empty.path());
    for (const auto& row : rows) {
        const TempFile input;
        fill(input.path(), row.input);
        const std::string file = row.input.count == 0 ? "" : input.path();
        const long peak = peakOf(row.arguments, file) - baseline;
        EXPECT_LE(peak, row.resultKiB + row.moreKiB) << row.line << ": " << row.arguments;
        RecordProperty(row.arguments, static_cast<int>(peak));
        std::printf("%6ld KiB beyond a result of %6ld: %s\n", peak - row.resultKiB, row.resultKiB,
                    row.arguments);
    }
}

}  // namespace
