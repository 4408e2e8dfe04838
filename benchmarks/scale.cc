#include "benchmarks/context.h"
#include "benchmarks/host_values.h"
#include "embedded/builtins/binary_read.h"
#include "embedded/builtins/open_close.h"
#include "fileio/buffers/element_conversion.h"
#include "fileio/text/input_string_stream.h"

#include <algorithm>
#include <cstdint>
#include <memory>

// Costs at different sizes. What stands for the limit is the same work at the smallest size, so
// that a cost that does not depend on the size is 1.
namespace bench {
namespace {

namespace embedded = Orvandeil::FileIO::embedded;

constexpr std::size_t smallest = 10000;

using Work = std::function<void(Trial&)>;
// Prepares the work on `count` elements.
using MakeWork = Work (*)(Context& context, std::size_t count);

Work printWork(Context&, std::size_t count) {
    const std::shared_ptr<vxArray> array =
        embedded::makeDoubles(1, count, integers(count, -1000000, 1000000));
    return [array](Trial& trial) {
        const vxArray* const arrays[] = {array.get()};
        printToBlock(trial, u"%d\n", arrays);
    };
}

Work scanWork(Context&, std::size_t count) {
    std::string text;
    for (const double value : integers(count, -1000000, 1000000))
        text += std::to_string(static_cast<int>(value)) + '\n';
    const auto shared = std::make_shared<const std::string>(std::move(text));
    return [shared](Trial& trial) { scanBytes(trial, *shared, u"%d"); };
}

Work readWork(Context& context, std::size_t count) {
    const std::string path =
        context.file(std::to_string(count) + ".bin", bytesOf(reals(count, -1000, 1000)));
    return [path](Trial& trial) {
        const ArrayPtr array = trial.time([&] {
            const auto file = embedded::openFile(path, {});
            const embedded::ReadAttributes attributes("double=>double",
                                                      Orvandeil::FileIO::MachineFormat());
            return embedded::readBinary(*file, attributes).array;
        });
        keep(array.get());
    };
}

Work convertWork(Context&, std::size_t count) {
    const auto from =
        std::make_shared<const std::vector<double>>(nearIntegers(count, -100000, 100000));
    const auto to = std::make_shared<std::vector<std::int32_t>>(count);
    return [from, to](Trial& trial) {
        trial.time([&] {
            Orvandeil::FileIO::AssignToVoidBuffer(vxINT32_CLASS, to->data(), vxDOUBLE_CLASS,
                                                  from->data(), from->size());
            keep(to->data());
        });
    };
}

Work decodeWork(Context&, std::size_t count) {
    const auto bytes = std::make_shared<const std::string>(count, 'a');
    const auto units = std::make_shared<std::u16string>(count, u'\0');
    return [bytes, units](Trial& trial) {
        trial.time([&] {
            Orvandeil::FileIO::inputStringStream stream(bytes->c_str(),
                                                        static_cast<long>(bytes->size()), "UTF-8");
            stream.GetNCodePoints(units->data(), units->size(), nullptr);
            keep(units->data());
        });
    };
}

// The time of `times` runs, told for `factor` as many.
Contender repeated(const std::string& name, const Work& work, std::size_t times, double factor) {
    return {name, [=](Trial& trial) {
                for (std::size_t i = trial.compares() ? times - 1 : 0; i < times; ++i) {
                    Trial inner(false);
                    work(inner);
                    trial.addSeconds(factor * inner.totalSeconds());
                }
                trial.result("ran");
            }};
}

Job makeJob(Context& context, MakeWork makeWork, std::size_t count) {
    constexpr std::size_t least = 1000000;
    const std::size_t total = std::max(count, least);
    const double factor = static_cast<double>(total) / static_cast<double>(least);
    return perElement(total,
                      {repeated(ours, makeWork(context, count), total / count, 1),
                       repeated(limit, makeWork(context, smallest), least / smallest, factor)});
}

struct Family {
    const char* name;
    MakeWork makeWork;
};

constexpr Family families[] = {
    {"print-int", printWork}, {"scan-int", scanWork}, {"read-double", readWork},
    {"convert", convertWork}, {"decode", decodeWork},
};

}  // namespace

void addScaleJobs(JobList& jobs, std::size_t largest) {
    for (const Family& family : families) {
        int exponent = 4;
        for (std::size_t count = smallest; count <= largest; count *= 10) {
            const std::string name =
                std::string("scale-") + family.name + ".1e" + std::to_string(exponent++);
            jobs.push_back({name, [family, count](Context& context) {
                                return makeJob(context, family.makeWork, count);
                            }});
        }
    }
}

}  // namespace bench
