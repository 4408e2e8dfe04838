#include "benchmarks/host_values.h"
#include "benchmarks/print_formats.h"

#include <charconv>
#include <cstdio>
#include <string>

// Single calls, with every object built and destroyed.
namespace bench {
namespace {

// So many that a run takes long enough to be timed, and seldom so long that it is interrupted.
constexpr int calls = 2000;

// Makes the result many times, each in the place of the one before, and hands on the last.
template <class Call, class Tell>
std::function<void(Trial&)> repeated(Call call, Tell tell) {
    return [=](Trial& trial) {
        const int count = trial.compares() ? 1 : calls;
        decltype(call()) last;
        trial.time([&] {
            for (int i = 0; i < count; ++i)
                last = call();
        });
        tell(trial, last);
    };
}

Job perCall(std::vector<Contender> contenders) {
    return {"us/call", 1e6 / calls, std::move(contenders)};
}

char text[mostCharacters];

Job makePrintJob(Context&) {
    static const ArrayPtr whole = Orvandeil::FileIO::embedded::makeScalar(12);
    static const ArrayPtr real = Orvandeil::FileIO::embedded::makeScalar(3.14159);
    static const vxArray* arguments[] = {whole.get(), real.get()};
    static const std::u16string format = u"%d,%8.3f\n";
    const auto library = [] { return printed(format, arguments); };
    const auto tell = [](Trial& trial, const Printed& last) { trial.result(last.text()); };
    const auto loop = [](auto print) {
        return [print](Trial& trial) {
            const int count = trial.compares() ? 1 : calls;
            std::size_t length = 0;
            trial.time([&] {
                for (int i = 0; i < count; ++i) {
                    length = print();
                    keep(text);
                }
            });
            trial.result(std::string_view(text, length));
        };
    };
    const auto byC = [] {
        return static_cast<std::size_t>(
            std::snprintf(text, sizeof text, "%d,%8.3f\n", 12, 3.14159));
    };
    const auto byChars = [] {
        char* const comma = put(std::to_chars(text, std::end(text), 12).ptr, ',');
        return static_cast<std::size_t>(put(putFixed(comma, 3.14159, 8, 3), '\n') - text);
    };
    return perCall(
        {{ours, repeated(library, tell)}, {"sprintf", loop(byC)}, {limit, loop(byChars)}});
}

Job makeScanJob(Context&) {
    static const std::string fields = "12,3.5";
    static const std::u16string format = u"%d,%f";
    const auto library = [] { return scanned(fields, format); };
    const auto tell = [](Trial& trial, const ArrayPtr& last) { resultOfArray(trial, *last); };
    const auto loop = [](auto scan) {
        return [scan](Trial& trial) {
            const int count = trial.compares() ? 1 : calls;
            double values[2] = {};
            trial.time([&] {
                for (int i = 0; i < count; ++i) {
                    scan(values);
                    keep(values);
                }
            });
            trial.resultOf(values, 2);
        };
    };
    const auto byC = [](double* values) {
        int whole = 0;
        std::sscanf("12,3.5", "%d,%lf", &whole, &values[1]);
        values[0] = whole;
    };
    const auto byChars = [](double* values) {
        static const std::string input = "12,3.5";
        const char* const end = input.data() + input.size();
        int whole = 0;
        const char* const comma = std::from_chars(input.data(), end, whole).ptr;
        std::from_chars(comma + 1, end, values[1]);
        values[0] = whole;
    };
    return perCall(
        {{ours, repeated(library, tell)}, {"sscanf", loop(byC)}, {limit, loop(byChars)}});
}

}  // namespace

void addCallJobs(JobList& jobs) {
    jobs.push_back({"call-print", makePrintJob});
    jobs.push_back({"call-scan", makeScanJob});
}

}  // namespace bench
