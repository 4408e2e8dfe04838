#include "benchmarks/host_values.h"
#include "benchmarks/huge_block.h"
#include "benchmarks/limit_loops.h"
#include "benchmarks/peers.h"
#include "embedded/builtins/binary_read.h"
#include "embedded/builtins/open_close.h"

#include <cstring>
#include <fcntl.h>
#include <fstream>
#include <memory>
#include <unistd.h>

namespace bench {
namespace {

namespace embedded = Orvandeil::FileIO::embedded;

// What is read. `fromFile` and `inMemory` bytes stand for the same elements, as small a number of
// them as both sides can be cut to.
struct Reading {
    const char* name;
    const char* precision;
    const char* machineFormat;
    double skip;
    std::size_t fromFile;
    std::size_t inMemory;
    std::size_t elements;
    std::string (*bytes)(std::size_t count);
    // Converts that many groups.
    void (*limitLoop)(const char* from, std::size_t groups, char* to);
    // Without the path, which is the first argument.
    std::vector<std::string> numpy;
    std::vector<std::string> r;
};

template <class T>
std::string bytesFrom(const std::vector<double>& values) {
    return std::string(bytesOf(elements<T>(values)));
}

std::string doubleBytes(std::size_t count) {
    return bytesFrom<double>(reals(count, -200, 200));
}

std::string int16Bytes(std::size_t count) {
    return bytesFrom<std::int16_t>(integers(count, -32768, 32767));
}

std::string blocksOfFour(std::size_t count) {
    return int16Bytes(4 * count - 3);
}

std::string packed12(std::size_t count) {
    return bytesFrom<std::uint8_t>(integers(count / 2 * 3, 0, 255));
}

std::string swapped8(std::size_t count) {
    const std::vector<double> values = reals(count, -200, 200);
    std::string bytes(count * sizeof(double), '\0');
    swapBytes(reinterpret_cast<const std::uint64_t*>(values.data()), count,
              reinterpret_cast<std::uint64_t*>(bytes.data()));
    return bytes;
}

template <class From, class To, void (*loop)(const From*, std::size_t, To*)>
void looped(const char* from, std::size_t groups, char* to) {
    loop(reinterpret_cast<const From*>(from), groups, reinterpret_cast<To*>(to));
}

const std::vector<Reading>& readings() {
    static const std::vector<Reading> all = {
        {"double",
         "double=>double",
         "n",
         0,
         8,
         8,
         1,
         doubleBytes,
         nullptr,
         {"read", "<f8", "<f8"},
         {"readNumbers", "double", "8", "little"}},
        {"int16-double",
         "int16=>double",
         "n",
         0,
         2,
         8,
         1,
         int16Bytes,
         looped<std::int16_t, double, convert>,
         {"read", "<i2", "<f8"},
         {"readNumbers", "integer", "2", "little"}},
        {"double-int8",
         "double=>int8",
         "n",
         0,
         8,
         1,
         1,
         doubleBytes,
         looped<double, std::int8_t, convert>,
         {"read_saturated", "<f8", "i1"},
         {}},
        {"swapped-double",
         "double=>double",
         "b",
         0,
         8,
         8,
         1,
         swapped8,
         looped<std::uint64_t, std::uint64_t, swapBytes>,
         {"read", ">f8", "<f8"},
         {"readNumbers", "double", "8", "big"}},
        {"swapped-int16",
         "int16=>int16",
         "b",
         0,
         2,
         2,
         1,
         int16Bytes,
         looped<std::uint16_t, std::uint16_t, swapBytes>,
         {"read", ">i2", "<i2"},
         {}},
        {"skip",
         "int16=>int16",
         "n",
         6,
         8,
         2,
         1,
         blocksOfFour,
         looped<std::uint16_t, std::uint16_t, everyFourth>,
         {"read_strided", "<i2", "6"},
         {}},
        {"ubit12",
         "ubit12=>uint16",
         "n",
         0,
         3,
         4,
         2,
         packed12,
         looped<unsigned char, std::uint16_t, unpack12>,
         {"read_ubit12"},
         {}},
    };
    return all;
}

void byOurs(Trial& trial, const Reading& reading, const std::string& path) {
    const ArrayPtr skip = embedded::makeScalar(reading.skip);
    const embedded::ReadResult result = trial.time([&] {
        const auto file = embedded::openFile(path, {});
        const embedded::ReadAttributes attributes(
            reading.precision, Orvandeil::FileIO::MachineFormat(reading.machineFormat), nullptr,
            skip.get());
        return embedded::readBinary(*file, attributes);
    });
    resultOfArray(trial, *result.array);
}

class Descriptor {
public:
    explicit Descriptor(const std::string& path) : number(open(path.c_str(), O_RDONLY)) {}
    ~Descriptor() { close(number); }
    Descriptor(const Descriptor&) = delete;
    Descriptor& operator=(const Descriptor&) = delete;

    // Fewer than `room` at the end of the file only.
    std::size_t fill(char* block, std::size_t room) const {
        std::size_t used = 0;
        ssize_t got;
        while (used < room && (got = read(number, block + used, room - used)) > 0)
            used += static_cast<std::size_t>(got);
        return used;
    }

private:
    int number;
};

// Blocks of about 64 KB, converted into the new block.
void inBlocks(const Reading& reading, const Descriptor& file, std::size_t room, char* out) {
    const std::size_t blockBytes = 65536 / reading.fromFile * reading.fromFile;
    const auto block = std::make_unique<char[]>(blockBytes + reading.fromFile);
    const char* const end = out + room;
    while (out != end) {
        const std::size_t got = file.fill(block.get(), blockBytes);
        const std::size_t groups = (got + reading.fromFile - 1) / reading.fromFile;
        reading.limitLoop(block.get(), groups, out);
        out += groups * reading.inMemory;
    }
}

void byLimit(Trial& trial, const Reading& reading, const std::string& path, std::size_t room) {
    const auto block = trial.time([&] {
        auto fresh = std::make_unique<HugeBlock>(room);
        const Descriptor file(path);
        if (reading.limitLoop) {
            inBlocks(reading, file, room, fresh->as<char>());
        } else {
            file.fill(fresh->as<char>(), room);
        }
        keep(fresh->as<char>());
        return fresh;
    });
    trial.result(std::string_view(block->as<char>(), room));
}

void addInterpreters(std::vector<Contender>& contenders, Context& context, const Reading& reading,
                     const std::string& path, std::size_t count) {
    std::vector<std::string> call = reading.numpy;
    call.insert(call.begin() + 1, path);
    addPython(contenders, context, "numpy", call);
    if (reading.r.empty()) return;
    call = reading.r;
    call.insert(call.begin() + 1, path);
    call.insert(call.end() - 1, std::to_string(count));
    addR(contenders, context, call);
}

Job makeJob(const Reading& reading, Context& context) {
    const std::size_t count = context.scaled(10000000);
    const std::string path = context.file("read.bin", reading.bytes(count));
    std::vector<Contender> contenders = {
        {ours, [=, &reading](Trial& trial) { byOurs(trial, reading, path); }}};
    addInterpreters(contenders, context, reading, path, count);
    const std::size_t room = count / reading.elements * reading.inMemory;
    contenders.push_back(
        {limit, [=, &reading](Trial& trial) { byLimit(trial, reading, path, room); }});
    return perElement(count, std::move(contenders));
}

}  // namespace

void addReadJobs(JobList& jobs) {
    for (const Reading& reading : readings()) {
        jobs.push_back({std::string("read-") + reading.name,
                        [&reading](Context& context) { return makeJob(reading, context); }});
    }
}

}  // namespace bench
