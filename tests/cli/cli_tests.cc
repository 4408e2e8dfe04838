#include "tests/cli/transcript.h"

#include <cstdio>
#include <cstdlib>
#include <filesystem>

#include <gtest/gtest.h>

namespace {

class TranscriptTest : public testing::Test {
public:
    TranscriptTest(transcript::Case testCase, std::string programPath)
        : example(std::move(testCase)), program(std::move(programPath)) {}

    void TestBody() override {
        EXPECT_EQ(transcript::run(example.command, program), example.expected)
            << example.file << ':' << example.line << ": $ " << example.command;
    }

private:
    transcript::Case example;
    std::string program;
};

// README's commands call a script that builds first; only they name the path.
bool isProgramCommand(const transcript::Case& example) {
    return !example.file.ends_with(".md") ||
           example.command.find("bin/fileio") != std::string::npos;
}

void registerCase(const transcript::Case& example, const std::string& program) {
    const std::string suite = std::filesystem::path(example.file).stem().string();
    const std::string name = "line" + std::to_string(example.line);
    const auto make = [example, program] { return new TranscriptTest(example, program); };
    testing::RegisterTest(suite.c_str(), name.c_str(), nullptr, nullptr, example.file.c_str(),
                          example.line, make);
}

}  // namespace

// The program, then the transcripts.
int main(int argc, char** argv) {
    testing::InitGoogleTest(&argc, argv);
    for (int i = 2; i < argc; ++i) {
        for (const transcript::Case& example : transcript::read(argv[i])) {
            if (isProgramCommand(example)) registerCase(example, argv[1]);
        }
    }
    if (argc < 3) {
        std::fprintf(stderr, "usage: %s PROGRAM TRANSCRIPT...\n", argv[0]);
        return EXIT_FAILURE;
    }
    return RUN_ALL_TESTS();
}
