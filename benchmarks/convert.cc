#include "benchmarks/host_values.h"
#include "benchmarks/limit_loops.h"
#include "benchmarks/peers.h"
#include "fileio/buffers/element_conversion.h"

#include <memory>

namespace bench {
namespace {

namespace embedded = Orvandeil::FileIO::embedded;

template <class From, class To>
struct Conversion {
    const char* name;
    vxClassID from;
    vxClassID to;
    std::vector<double> (*values)(std::size_t, std::int64_t, std::int64_t);
    std::int64_t low;
    std::int64_t high;
    const char* numpyFrom;
    const char* numpyTo;
    const char* numpyCall;
};

template <class From, class To>
struct ConvertInput {
    std::vector<From> source;
    std::vector<To> target;
};

// Both work in the same block, whose pages are there.
template <class From, class To, class Work>
void intoTarget(Trial& trial, ConvertInput<From, To>& input, Work work) {
    trial.time([&] {
        work(input.source.data(), input.source.size(), input.target.data());
        keep(input.target.data());
    });
    trial.resultOf(input.target.data(), input.target.size());
}

template <class From, class To>
Job makeJob(const Conversion<From, To>& conversion, Context& context) {
    const std::size_t count = context.scaled(10000000);
    auto input = std::make_shared<ConvertInput<From, To>>();
    input->source = elements<From>(conversion.values(count, conversion.low, conversion.high));
    input->target.resize(count);
    const std::string path =
        context.file(std::string(conversion.name) + ".bin", bytesOf(input->source));
    const auto library = [conversion](const From* from, std::size_t elements, To* to) {
        Orvandeil::FileIO::AssignToVoidBuffer(conversion.to, to, conversion.from, from, elements);
    };
    const auto bareLoop = [](const From* from, std::size_t elements, To* to) {
        convert(from, elements, to);
    };
    std::vector<Contender> contenders = {
        {ours, [=](Trial& trial) { intoTarget(trial, *input, library); }}};
    addPython(contenders, context, "numpy",
              {conversion.numpyCall, path, conversion.numpyFrom, conversion.numpyTo});
    contenders.push_back({limit, [=](Trial& trial) { intoTarget(trial, *input, bareLoop); }});
    return perElement(count, std::move(contenders));
}

template <class From, class To>
void add(JobList& jobs, const Conversion<From, To>& conversion) {
    jobs.push_back({std::string("convert-") + conversion.name,
                    [conversion](Context& context) { return makeJob(conversion, context); }});
}

}  // namespace

void addConvertJobs(JobList& jobs) {
    add<double, std::int32_t>(jobs, {"double-int32", vxDOUBLE_CLASS, vxINT32_CLASS, nearIntegers,
                                     -3000000000, 3000000000, "f8", "i4", "convert_saturated"});
    add<double, std::uint8_t>(jobs, {"double-uint8", vxDOUBLE_CLASS, vxUINT8_CLASS, nearIntegers,
                                     -100, 400, "f8", "u1", "convert_saturated"});
    add<double, float>(jobs, {"double-single", vxDOUBLE_CLASS, vxSINGLE_CLASS, nearIntegers, -1000,
                              1000, "f8", "f4", "convert"});
    add<std::int16_t, double>(jobs, {"int16-double", vxINT16_CLASS, vxDOUBLE_CLASS, integers,
                                     -32768, 32767, "i2", "f8", "convert"});
    add<float, std::int16_t>(jobs, {"single-int16", vxSINGLE_CLASS, vxINT16_CLASS, nearIntegers,
                                    -40000, 40000, "f4", "i2", "convert_saturated"});
    add<std::int32_t, std::int8_t>(jobs, {"int32-int8", vxINT32_CLASS, vxINT8_CLASS, integers, -200,
                                          200, "i4", "i1", "convert_saturated"});
}

}  // namespace bench
