#pragma once

#include <chrono>
#include <cstddef>
#include <functional>
#include <string>
#include <string_view>
#include <vector>

namespace bench {

// One execution of a contender. It times its work by time(), preparation and clean-up outside, and
// hands its result over when results are compared.
class Trial {
public:
    explicit Trial(bool compares) : comparing(compares) {}

    // Adds the time that the work takes, and returns what it returns.
    template <class Work>
    decltype(auto) time(Work work) {
        struct Span {
            Trial& trial;
            std::chrono::steady_clock::time_point start = std::chrono::steady_clock::now();
            ~Span() { trial.addSeconds(secondsSince(start)); }
        };
        const Span span{*this};
        return work();
    }
    // For work that another process has timed.
    void addSeconds(double more) { seconds += more; }

    // Whether the results are compared this time.
    bool compares() const { return comparing; }
    // Add to the result: bytes as they are, UTF-16 as UTF-8.
    void result(std::string_view bytes);
    void result(std::u16string_view text);
    template <class T>
    void resultOf(const T* elements, std::size_t count) {
        result(std::string_view(reinterpret_cast<const char*>(elements), count * sizeof(T)));
    }
    void resultOfFile(const std::string& path);

    double totalSeconds() const { return seconds; }
    const std::string& collected() const { return bytesOfResult; }

private:
    static double secondsSince(std::chrono::steady_clock::time_point start) {
        return std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
    }

    bool comparing;
    double seconds = 0;
    std::string bytesOfResult;
};

// For files that are about to be written: replacing the contents of one would make the file system
// write them out at once.
void removeFile(const std::string& path);

// Keeps the compiler from dropping the work that made the memory behind it.
inline void keep(const void* memory) {
    asm volatile("" : : "r"(memory) : "memory");
}

inline constexpr char ours[] = "ours";
inline constexpr char limit[] = "limit";

struct Contender {
    std::string name;  // ours, limit, or a peer; of several under one name the fastest counts
    std::function<void(Trial&)> run;
};

struct Job {
    const char* unit;       // "ns/element", "ns/byte", "us/call" or "ms/run"
    double unitsPerSecond;  // the scale of the unit, divided by what one run handles
    std::vector<Contender> contenders;
};

inline Job perElement(std::size_t elements, std::vector<Contender> contenders) {
    return {"ns/element", 1e9 / static_cast<double>(elements), std::move(contenders)};
}
inline Job perByte(std::size_t bytes, std::vector<Contender> contenders) {
    return {"ns/byte", 1e9 / static_cast<double>(bytes), std::move(contenders)};
}

class Context;

// A job is made, with its data, when its turn comes.
struct JobEntry {
    std::string name;
    std::function<Job(Context&)> make;
};
using JobList = std::vector<JobEntry>;

void addPrintJobs(JobList& jobs);
void addPrintTextJobs(JobList& jobs);
void addScanJobs(JobList& jobs);
void addReadJobs(JobList& jobs);
void addWriteJobs(JobList& jobs);
void addConvertJobs(JobList& jobs);
void addTranscodeJobs(JobList& jobs);
void addUnitsJobs(JobList& jobs);
void addLinesJobs(JobList& jobs);
void addCallJobs(JobList& jobs);
void addProgramJobs(JobList& jobs);
void addScaleJobs(JobList& jobs, std::size_t largest);

}  // namespace bench
