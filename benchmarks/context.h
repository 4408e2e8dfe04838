#pragma once

#include "benchmarks/child.h"

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace bench {

// What jobs are made from: the size of the run and a folder for files.
class Context {
public:
    explicit Context(bool quickRun);
    ~Context();
    Context(const Context&) = delete;
    Context& operator=(const Context&) = delete;

    bool isQuick() const { return quick; }
    // A tenth in a quick run.
    std::size_t scaled(std::size_t count) const { return quick ? count / 10 : count; }

    // A path in the folder, which goes with everything in it at the end.
    std::string path(std::string_view name) const;
    // A file of these bytes there.
    std::string file(std::string_view name, std::string_view bytes) const;
    // Removes all files.
    void clear() const;

    // Interpreters with their peers, started when they are first asked for.
    Interpreter& python();
    Interpreter& r();

private:
    bool quick;
    std::string folder;
    std::unique_ptr<Interpreter> pythonPeers;
    std::unique_ptr<Interpreter> rPeers;
};

// The same numbers in every run (splitmix64).
class Random {
public:
    std::uint64_t next();
    // Uniform in [low, high).
    double uniform(double low, double high);
    // Uniform in [low, high], both ends included.
    std::int64_t integer(std::int64_t low, std::int64_t high);

private:
    std::uint64_t state = 20240229;
};

std::vector<double> integers(std::size_t count, std::int64_t low, std::int64_t high);
std::vector<double> reals(std::size_t count, double low, double high);
// Near whole numbers on either side, and never half-way between two.
std::vector<double> nearIntegers(std::size_t count, std::int64_t low, std::int64_t high);

template <class T>
std::vector<T> elements(const std::vector<double>& values) {
    return {values.begin(), values.end()};
}

template <class T>
std::string_view bytesOf(const std::vector<T>& elements) {
    return {reinterpret_cast<const char*>(elements.data()), elements.size() * sizeof(T)};
}

}  // namespace bench
