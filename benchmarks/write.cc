#include "benchmarks/host_values.h"
#include "benchmarks/limit_loops.h"
#include "benchmarks/peers.h"
#include "embedded/builtins/binary_write.h"
#include "embedded/builtins/open_close.h"

#include <algorithm>
#include <fcntl.h>
#include <memory>
#include <unistd.h>

namespace bench {
namespace {

namespace embedded = Orvandeil::FileIO::embedded;

struct WriteInput {
    std::vector<double> values;
    ArrayPtr array;
    std::string path;
};

void byOurs(Trial& trial, const WriteInput& input) {
    removeFile(input.path);
    trial.time([&] {
        embedded::OpenRequest request;
        request.permission = "w";
        auto file = embedded::openFile(input.path, request);
        const embedded::WriteAttributes attributes(*input.array, "int16",
                                                   Orvandeil::FileIO::MachineFormat());
        embedded::writeBinary(*file, *input.array, attributes);
        embedded::closeFile(std::move(file));
    });
    trial.resultOfFile(input.path);
}

// Blocks of 64 KB, converted and written.
void byLimit(Trial& trial, const WriteInput& input) {
    removeFile(input.path);
    trial.time([&] {
        constexpr std::size_t blockElements = 32768;
        const auto block = std::make_unique<std::int16_t[]>(blockElements);
        const int file = open(input.path.c_str(), O_WRONLY | O_CREAT | O_TRUNC, 0666);
        bool isWritten = true;
        for (std::size_t at = 0; at < input.values.size() && isWritten; at += blockElements) {
            const std::size_t count = std::min(blockElements, input.values.size() - at);
            convert(input.values.data() + at, count, block.get());
            isWritten = write(file, block.get(), count * sizeof(std::int16_t)) > 0;
        }
        close(file);
    });
    trial.resultOfFile(input.path);
}

Job makeJob(Context& context) {
    const std::size_t count = context.scaled(10000000);
    auto input = std::make_shared<WriteInput>();
    input->values = nearIntegers(count, -40000, 40000);
    input->array = embedded::makeDoubles(1, count, input->values);
    input->path = context.path("written.bin");
    const std::string source = context.file("values.bin", bytesOf(input->values));
    std::vector<Contender> contenders = {{ours, [=](Trial& trial) { byOurs(trial, *input); }}};
    addPython(contenders, context, "numpy", {"write_saturated", source, "f8", "<i2", input->path});
    contenders.push_back({limit, [=](Trial& trial) { byLimit(trial, *input); }});
    return perElement(count, std::move(contenders));
}

}  // namespace

void addWriteJobs(JobList& jobs) {
    jobs.push_back({"write-int16", makeJob});
}

}  // namespace bench
