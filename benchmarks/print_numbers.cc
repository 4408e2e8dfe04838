#include "benchmarks/host_values.h"
#include "benchmarks/job.h"
#include "benchmarks/limit_loops.h"
#include "benchmarks/print_formats.h"
#include "embedded/builtins/open_close.h"
#include "embedded/builtins/print.h"

#include <fstream>
#include <memory>
#include <sstream>

namespace bench {
namespace {

namespace embedded = Orvandeil::FileIO::embedded;

// Shared by the contenders of one job.
struct PrintInput {
    std::vector<double> values;
    embedded::ArrayPtr array;
    std::string path;                // of the file that all of them write
    std::unique_ptr<char[]> narrow;  // blocks that hold the longest result
    std::unique_ptr<char16_t[]> wide;
};
using Input = std::shared_ptr<const PrintInput>;

template <class Format>
Input makeInput(Context& context) {
    auto input = std::make_shared<PrintInput>();
    const std::size_t count = context.scaled(1000000) / Format::values * Format::values;
    input->values = Format::data(count);
    input->array = embedded::makeDoubles(1, count, input->values);
    input->path = context.path("printed.txt");
    const std::size_t room = count * mostCharacters;
    input->narrow.reset(new char[room]);
    input->wide.reset(new char16_t[room]);
    return input;
}

// Calls `pass` with the arguments of every pass over the format.
template <class Format, class Pass>
void forEachPass(const PrintInput& input, Pass pass) {
    const double* const end = input.values.data() + input.values.size();
    for (const double* v = input.values.data(); v != end; v += Format::values)
        pass(v);
}

template <class Format, class Append>
void intoBlock(Trial& trial, const PrintInput& input, Append append) {
    char* const begin = input.narrow.get();
    const char* const end = trial.time([&] {
        char* out = begin;
        forEachPass<Format>(input, [&](const double* v) { out = append(out, v); });
        keep(begin);
        return out;
    });
    trial.result(std::string_view(begin, static_cast<std::size_t>(end - begin)));
}

template <class Format>
std::vector<Contender> stringPeers(const Input& input) {
    const auto cLoop = [](char* out, const double* v) {
        return out + Format::c(v, [out](const char* format, auto... values) {
                   return std::sprintf(out, format, values...);
               });
    };
    const auto compiledLoop = [](char* out, const double* v) {
        return Format::arguments(v, [out](auto... values) {
            return fmt::format_to(out, Format::compiled(), values...);
        });
    };
    const auto runtimeLoop = [](char* out, const double* v) {
        return Format::arguments(v, [out](auto... values) {
            return fmt::format_to(out, fmt::runtime(Format::runtime), values...);
        });
    };
    const auto streamLoop = [input](Trial& trial) {
        std::ostringstream out;
        Format::prepare(out);
        trial.time([&] { forEachPass<Format>(*input, [&](auto* v) { Format::stream(out, v); }); });
        trial.result(out.view());
    };
    return {
        {"sprintf", [=](Trial& trial) { intoBlock<Format>(trial, *input, cLoop); }},
        {"fmt", [=](Trial& trial) { intoBlock<Format>(trial, *input, compiledLoop); }},
        {"fmt", [=](Trial& trial) { intoBlock<Format>(trial, *input, runtimeLoop); }},
        {"iostream", streamLoop},
    };
}

// Digits into a small block and from there, widened, into the large one.
template <class Format>
std::size_t widenedDigits(const PrintInput& input) {
    constexpr std::size_t blockSize = 4096;
    char block[blockSize];
    char* next = block;
    char16_t* wide = input.wide.get();
    const auto flush = [&] {
        const auto count = static_cast<std::size_t>(next - block);
        widen(block, count, wide);
        wide += count;
        next = block;
    };
    forEachPass<Format>(input, [&](const double* v) {
        if (next > block + blockSize - mostCharacters) flush();
        next = Format::chars(next, v);
    });
    flush();
    return static_cast<std::size_t>(wide - input.wide.get());
}

template <class Format>
Job makeStringJob(Context& context) {
    const Input input = makeInput<Format>(context);
    std::vector<Contender> contenders = stringPeers<Format>(input);
    contenders.insert(contenders.begin(), {ours, [input](Trial& trial) {
                                               const vxArray* const arrays[] = {input->array.get()};
                                               printToBlock(trial, Format::text, arrays);
                                           }});
    contenders.push_back({limit, [input](Trial& trial) {
                              const std::size_t count = trial.time([&] {
                                  const std::size_t units = widenedDigits<Format>(*input);
                                  keep(input->wide.get());
                                  return units;
                              });
                              trial.result(std::u16string_view(input->wide.get(), count));
                          }});
    return perElement(input->values.size(), std::move(contenders));
}

template <class Format>
void oursToFile(Trial& trial, const PrintInput& input) {
    removeFile(input.path);
    trial.time([&] {
        embedded::OpenRequest request;
        request.permission = "w";
        auto file = embedded::openFile(input.path, request);
        const vxArray* arrays[] = {input.array.get()};
        embedded::print(*file, Format::text, arrays);
        embedded::closeFile(std::move(file));
    });
    trial.resultOfFile(input.path);
}

// Opens, lets `write` write, and closes.
template <class Write>
void intoFile(Trial& trial, const PrintInput& input, Write write) {
    removeFile(input.path);
    trial.time([&] {
        std::FILE* const file = std::fopen(input.path.c_str(), "w");
        write(file);
        std::fclose(file);
    });
    trial.resultOfFile(input.path);
}

template <class Format>
void streamToFile(Trial& trial, const PrintInput& input) {
    removeFile(input.path);
    trial.time([&] {
        std::ofstream out(input.path);
        Format::prepare(out);
        forEachPass<Format>(input, [&](const double* v) { Format::stream(out, v); });
    });
    trial.resultOfFile(input.path);
}

template <class Format>
std::vector<Contender> filePeers(const Input& input) {
    const auto cLoop = [input](std::FILE* file) {
        forEachPass<Format>(*input, [&](const double* v) {
            Format::c(v, [file](const char* format, auto... values) {
                return std::fprintf(file, format, values...);
            });
        });
    };
    const auto compiledLoop = [input](std::FILE* file) {
        forEachPass<Format>(*input, [&](const double* v) {
            Format::arguments(
                v, [file](auto... values) { fmt::print(file, Format::compiled(), values...); });
        });
    };
    const auto runtimeLoop = [input](std::FILE* file) {
        forEachPass<Format>(*input, [&](const double* v) {
            Format::arguments(v, [file](auto... values) {
                fmt::print(file, fmt::runtime(Format::runtime), values...);
            });
        });
    };
    return {
        {"fprintf", [=](Trial& trial) { intoFile(trial, *input, cLoop); }},
        {"fmt", [=](Trial& trial) { intoFile(trial, *input, compiledLoop); }},
        {"fmt", [=](Trial& trial) { intoFile(trial, *input, runtimeLoop); }},
        {"iostream", [=](Trial& trial) { streamToFile<Format>(trial, *input); }},
    };
}

template <class Format>
Job makeFileJob(Context& context) {
    const Input input = makeInput<Format>(context);
    std::vector<Contender> contenders = filePeers<Format>(input);
    contenders.insert(contenders.begin(),
                      {ours, [=](Trial& trial) { oursToFile<Format>(trial, *input); }});
    const auto writeBlock = [input](std::FILE* file) {
        char* out = input->narrow.get();
        forEachPass<Format>(*input, [&](const double* v) { out = Format::chars(out, v); });
        std::fwrite(input->narrow.get(), 1, static_cast<std::size_t>(out - input->narrow.get()),
                    file);
    };
    contenders.push_back({limit, [=](Trial& trial) { intoFile(trial, *input, writeBlock); }});
    return perElement(input->values.size(), std::move(contenders));
}

template <class Format>
void addFormat(JobList& jobs) {
    const std::string name = std::string("print-") + Format::name;
    jobs.push_back({name + ".string", makeStringJob<Format>});
    jobs.push_back({name + ".file", makeFileJob<Format>});
}

}  // namespace

void addPrintJobs(JobList& jobs) {
    addFormat<IntFormat>(jobs);
    addFormat<HexFormat>(jobs);
    addFormat<GFormat>(jobs);
    addFormat<FifteenFormat>(jobs);
    addFormat<FixedFormat>(jobs);
    addFormat<MixedFormat>(jobs);
}

}  // namespace bench
