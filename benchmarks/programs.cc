#include "benchmarks/child.h"
#include "benchmarks/context.h"
#include "benchmarks/host_values.h"
#include "benchmarks/job.h"
#include "embedded/npy/npy_file.h"

#include <algorithm>
#include <cstdlib>
#include <fstream>
#include <sstream>

#include <fmt/format.h>

// Whole programs, from their start to their end.
namespace bench {
namespace {

constexpr char nowhere[] = "/dev/null";

// The text that a program prints, made comparable.
using Canonical = std::string (*)(const std::string& text);

std::string asItIs(const std::string& text) {
    return text;
}

// Numbers to the last bit, whatever way they are written.
std::string asNumbers(const std::string& text) {
    std::string bytes;
    const char* next = text.c_str();
    char* end = nullptr;
    for (double value; value = std::strtod(next, &end), end != next; next = end)
        bytes.append(reinterpret_cast<const char*>(&value), sizeof value);
    return bytes;
}

Contender program(const Context& context, const std::string& name, const Command& command,
                  Canonical canonical, int runs = 1) {
    const std::string saved = context.path("program.out");
    return {name, [=](Trial& trial) {
                if (trial.compares()) {
                    runProgram(command, saved);
                    Trial own(true);
                    own.resultOfFile(saved);
                    trial.result(canonical(own.collected()));
                    return;
                }
                trial.time([&] {
                    for (int i = 0; i < runs; ++i)
                        runProgram(command, nowhere);
                });
            }};
}

Job makeStartJob(Context& context) {
    constexpr int runs = 40;
    return {"ms/run",
            1e3 / runs,
            {program(context, ours, {FILEIO_PROGRAM, "printf", "hello"}, asItIs, runs),
             program(context, "coreutils", {"/usr/bin/printf", "hello"}, asItIs, runs)}};
}

// What the other program does is not the same, only a measure of how long a program takes.
Job makeDetectJob(Context& context) {
    constexpr int runs = 40;
    const std::string path =
        context.file("detected.txt", "Les \xC3\xA9l\xC3\xA8ves \xC3\xA9taient l\xC3\xA0.\n");
    const auto startOnly = [](const std::string&) { return std::string("started"); };
    return {"ms/run",
            1e3 / runs,
            {program(context, ours, {FILEIO_PROGRAM, "charset", path}, startOnly, runs),
             program(context, "coreutils", {"/usr/bin/printf", "hello"}, startOnly, runs)}};
}

Job makeReadJob(Context& context) {
    const std::vector<double> values = reals(context.scaled(1000000), -1000, 1000);
    const std::string path = context.file("doubles.bin", bytesOf(values));
    const Command command = {FILEIO_PROGRAM, "read", "--precision", "double=>double", path};
    return perElement(
        values.size(),
        {program(context, ours, command, asNumbers),
         program(context, "od", {"od", "-An", "-v", "-w8", "-tf8", path}, asNumbers)});
}

Job makePrintfJob(Context& context) {
    const std::vector<double> values = reals(context.scaled(1000000), -1000, 1000);
    const std::string path = context.path("doubles.npy");
    Orvandeil::FileIO::embedded::npyWrite(
        path, *Orvandeil::FileIO::embedded::makeDoubles(1, values.size(), values));
    std::string lines;
    for (const double value : values)
        lines += fmt::format("{:.17g}\n", value);
    const std::string text = context.file("doubles.txt", lines);
    const Command command = {FILEIO_PROGRAM, "printf", "%.15g\\n", "@" + path};
    const Command awk = {"awk", "{ printf \"%.15g\\n\", $1 }", text};
    return perElement(values.size(), {program(context, ours, command, asItIs),
                                      program(context, "awk", awk, asItIs)});
}

}  // namespace

void addProgramJobs(JobList& jobs) {
    jobs.push_back({"start", makeStartJob});
    jobs.push_back({"start-detect", makeDetectJob});
    jobs.push_back({"cli-read-f8", makeReadJob});
    jobs.push_back({"cli-printf", makePrintfJob});
}

}  // namespace bench
