#include "benchmarks/context.h"
#include "benchmarks/report.h"

#include <algorithm>
#include <cstdio>
#include <exception>
#include <fstream>
#include <getopt.h>
#include <stdexcept>
#include <string>

namespace bench {
namespace {

constexpr int rounds = 5;
constexpr char usage[] =
    "usage: bench [--quick] [--json FILE] [--markdown FILE] [--list] [JOB...]\n"
    "JOB is the name of a job or the beginning of some; without one all jobs run.\n";

struct Options {
    bool quick = false;
    bool list = false;
    std::string json;
    std::string markdown;
    std::vector<std::string> jobs;
};

Options parsed(int argc, char** argv) {
    constexpr option names[] = {{"quick", no_argument, nullptr, 'q'},
                                {"list", no_argument, nullptr, 'l'},
                                {"json", required_argument, nullptr, 'j'},
                                {"markdown", required_argument, nullptr, 'm'},
                                {nullptr, 0, nullptr, 0}};
    Options options;
    for (int key; (key = getopt_long(argc, argv, "", names, nullptr)) != -1;) {
        switch (key) {
            case 'q':
                options.quick = true;
                break;
            case 'l':
                options.list = true;
                break;
            case 'j':
                options.json = optarg;
                break;
            case 'm':
                options.markdown = optarg;
                break;
            default:
                throw std::invalid_argument(usage);
        }
    }
    options.jobs.assign(argv + optind, argv + argc);
    return options;
}

JobList allJobs() {
    JobList jobs;
    addPrintJobs(jobs);
    addScanJobs(jobs);
    addReadJobs(jobs);
    addWriteJobs(jobs);
    addConvertJobs(jobs);
    addTranscodeJobs(jobs);
    return jobs;
}

JobList chosenJobs(const std::vector<std::string>& beginnings) {
    JobList jobs = allJobs();
    const auto isBeginning = [](const std::string& name) {
        return [&name](const std::string& beginning) { return name.starts_with(beginning); };
    };
    for (const std::string& beginning : beginnings) {
        const auto begins = [&](const JobEntry& job) { return job.name.starts_with(beginning); };
        if (std::ranges::none_of(jobs, begins))
            throw std::invalid_argument("no job '" + beginning + "'\n" + usage);
    }
    if (!beginnings.empty()) {
        std::erase_if(jobs, [&](const JobEntry& job) {
            return std::ranges::none_of(beginnings, isBeginning(job.name));
        });
    }
    return jobs;
}

void writeFile(const std::string& path, const std::string& text) {
    if (path.empty()) return;
    std::ofstream file(path);
    if (!(file << text).flush()) throw std::runtime_error(path + ": cannot be written");
}

// Rows in the order of the jobs. Says which jobs were refused; `refused` counts them.
Rows runJobs(const JobList& jobs, Context& context, int& refused) {
    Rows rows;
    std::fputs(tableHead().c_str(), stdout);
    for (const JobEntry& entry : jobs) {
        try {
            rows.push_back(measure(entry.name, entry.make(context), rounds));
            std::fputs(tableLine(rows.back()).c_str(), stdout);
            std::fflush(stdout);
        } catch (const std::exception& error) {
            std::fprintf(stderr, "%s: %s\n", entry.name.c_str(), error.what());
            ++refused;
        }
        context.clear();
    }
    return rows;
}

int run(int argc, char** argv) {
    const Options options = parsed(argc, argv);
    const JobList jobs = chosenJobs(options.jobs);
    if (options.list) {
        for (const JobEntry& job : jobs)
            std::puts(job.name.c_str());
        return 0;
    }
    Context context(options.quick);
    int refused = 0;
    const Rows rows = runJobs(jobs, context, refused);
    writeFile(options.json, asJson(rows));
    writeFile(options.markdown, asMarkdown(rows));
    return refused == 0 ? 0 : 1;
}

}  // namespace
}  // namespace bench

int main(int argc, char** argv) {
    try {
        return bench::run(argc, argv);
    } catch (const std::invalid_argument& error) {
        std::fputs(error.what(), stderr);
        return 2;
    } catch (const std::exception& error) {
        std::fprintf(stderr, "bench: %s\n", error.what());
        return 1;
    }
}
