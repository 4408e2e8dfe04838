#include "benchmarks/context.h"

#include <cerrno>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <stdexcept>
#include <system_error>

namespace bench {

namespace fs = std::filesystem;

Context::Context(bool quickRun) : quick(quickRun) {
    std::string pattern = fs::temp_directory_path() / "fileio-bench-XXXXXX";
    if (!mkdtemp(pattern.data())) throw std::system_error(errno, std::generic_category(), pattern);
    folder = pattern;
}

Context::~Context() {
    std::error_code ignored;
    fs::remove_all(folder, ignored);
}

std::string Context::path(std::string_view name) const {
    return folder + "/" + std::string(name);
}

std::string Context::file(std::string_view name, std::string_view bytes) const {
    const std::string where = path(name);
    std::ofstream out(where, std::ios::binary);
    out.write(bytes.data(), static_cast<std::streamsize>(bytes.size()));
    if (!out.flush()) throw std::runtime_error(where + ": cannot be written");
    return where;
}

// The system's own Python, which has the system's NumPy, whatever else PATH offers.
Interpreter& Context::python() {
    if (!pythonPeers) {
        pythonPeers.reset(
            new Interpreter({"/usr/bin/python3", FILEIO_BENCHMARKS_FOLDER "/peers.py"}));
    }
    return *pythonPeers;
}

Interpreter& Context::r() {
    if (!rPeers) {
        rPeers.reset(
            new Interpreter({"Rscript", "--vanilla", FILEIO_BENCHMARKS_FOLDER "/peers.R"}));
    }
    return *rPeers;
}

void Context::clear() const {
    for (const fs::directory_entry& entry : fs::directory_iterator(folder))
        fs::remove(entry.path());
}

std::uint64_t Random::next() {
    std::uint64_t z = state += 0x9e3779b97f4a7c15;
    z = (z ^ (z >> 30)) * 0xbf58476d1ce4e5b9;
    z = (z ^ (z >> 27)) * 0x94d049bb133111eb;
    return z ^ (z >> 31);
}

double Random::uniform(double low, double high) {
    return low + (high - low) * static_cast<double>(next() >> 11) * 0x1p-53;
}

std::int64_t Random::integer(std::int64_t low, std::int64_t high) {
    const auto span = static_cast<std::uint64_t>(high - low) + 1;
    return low + static_cast<std::int64_t>(next() % span);
}

std::vector<double> integers(std::size_t count, std::int64_t low, std::int64_t high) {
    Random random;
    std::vector<double> values(count);
    for (double& value : values)
        value = static_cast<double>(random.integer(low, high));
    return values;
}

std::vector<double> nearIntegers(std::size_t count, std::int64_t low, std::int64_t high) {
    Random random;
    std::vector<double> values(count);
    for (double& value : values)
        value = static_cast<double>(random.integer(low, high)) + random.uniform(-0.49, 0.49);
    return values;
}

std::vector<double> reals(std::size_t count, double low, double high) {
    Random random;
    std::vector<double> values(count);
    for (double& value : values)
        value = random.uniform(low, high);
    return values;
}

}  // namespace bench
