#include "benchmarks/charsets.h"
#include "benchmarks/context.h"
#include "benchmarks/host_values.h"
#include "embedded/builtins/open_close.h"
#include "embedded/builtins/scan.h"

#include <cstdio>
#include <memory>

namespace bench {
namespace {

namespace embedded = Orvandeil::FileIO::embedded;

// An encoded file is read three times: word by word, line by line with a set, and character by
// character. Blanks are not part of the first two results. Single characters are collected in
// memory that is there, here and by the limit.
using OneText = std::function<std::u16string(embedded::OpenFile& file, std::size_t room)>;

std::u16string scanned(embedded::OpenFile& file, const std::u16string& format) {
    const embedded::ScanResult result =
        embedded::scan(file, format, Orvandeil::FileIO::SizeAttribute());
    return {static_cast<const char16_t*>(vxArrayData(result.array.get())),
            embedded::elementCount(*result.array)};
}

std::u16string characters(embedded::OpenFile& file, std::size_t room) {
    std::u16string all;
    all.reserve(room);
    char16_t unit;
    while (file.stream->GetNCodePoints(&unit, 1, nullptr) == 1)
        all += unit;
    return all;
}

void byOurs(Trial& trial, const std::string& path, std::size_t room) {
    const OneText passes[] = {
        [](embedded::OpenFile& file, std::size_t) { return scanned(file, u"%s"); },
        [](embedded::OpenFile& file, std::size_t) { return scanned(file, u"%[^\n]%*c"); },
        characters,
    };
    embedded::OpenRequest request;
    request.encoding = "UTF-8";
    for (const OneText& pass : passes) {
        const auto file = embedded::openFile(path, request);
        trial.result(trial.time([&] { return pass(*file, room); }));
    }
}

// The bytes that `accepts` keeps, one at a time.
template <class Accepts>
std::string filtered(const std::string& path, std::size_t room, Accepts accepts) {
    std::string kept;
    kept.reserve(room);
    std::FILE* const file = std::fopen(path.c_str(), "r");
    for (int c; (c = getc_unlocked(file)) != EOF;) {
        if (accepts(c)) kept += static_cast<char>(c);
    }
    std::fclose(file);
    return kept;
}

void byLimit(Trial& trial, const std::string& path, std::size_t room) {
    trial.result(trial.time([&] { return filtered(path, room, [](int c) { return c > ' '; }); }));
    trial.result(trial.time([&] { return filtered(path, room, [](int c) { return c != '\n'; }); }));
    trial.result(trial.time([&] { return filtered(path, room, [](int) { return true; }); }));
}

Job makeJob(Context& context) {
    constexpr std::size_t passes = 3;
    const std::u16string text = textFor(charsets[0], context.scaled(10000000));
    const std::string bytes = encoded(charsets[0], text);
    const std::string path = context.file("units.txt", bytes);
    const std::size_t room = bytes.size();
    return perByte(passes * room, {{ours, [=](Trial& trial) { byOurs(trial, path, room); }},
                                   {limit, [=](Trial& trial) { byLimit(trial, path, room); }}});
}

}  // namespace

void addUnitsJobs(JobList& jobs) {
    jobs.push_back({"units-ascii", makeJob});
}

}  // namespace bench
