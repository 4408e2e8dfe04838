#include "benchmarks/context.h"
#include "benchmarks/report.h"

#include <algorithm>
#include <cstdio>
#include <exception>
#include <fstream>
#include <getopt.h>
#include <iterator>
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

JobList allJobs(bool quick) {
    JobList jobs;
    addPrintJobs(jobs);
    addPrintTextJobs(jobs);
    addScanJobs(jobs);
    addReadJobs(jobs);
    addWriteJobs(jobs);
    addConvertJobs(jobs);
    addTranscodeJobs(jobs);
    addUnitsJobs(jobs);
    addLinesJobs(jobs);
    addCallJobs(jobs);
    addProgramJobs(jobs);
    addScaleJobs(jobs, quick ? 1000000 : 100000000);
    return jobs;
}

// The job of that name, else those that begin with it.
JobList jobsNamed(const JobList& jobs, const std::string& name) {
    JobList chosen;
    const auto take = [&](auto matches) {
        std::ranges::copy_if(jobs, std::back_inserter(chosen), matches);
    };
    take([&](const JobEntry& job) { return job.name == name; });
    if (chosen.empty()) take([&](const JobEntry& job) { return job.name.starts_with(name); });
    if (chosen.empty()) throw std::invalid_argument("no job '" + name + "'\n" + usage);
    return chosen;
}

JobList chosenJobs(const Options& options) {
    const JobList jobs = allJobs(options.quick);
    if (options.jobs.empty()) return jobs;
    JobList chosen;
    for (const std::string& name : options.jobs)
        std::ranges::move(jobsNamed(jobs, name), std::back_inserter(chosen));
    return chosen;
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
    const JobList jobs = chosenJobs(options);
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
