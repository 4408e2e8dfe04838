#include "benchmarks/charsets.h"
#include "benchmarks/host_values.h"
#include "benchmarks/peers.h"
#include "embedded/builtins/open_close.h"
#include "embedded/builtins/text_lines.h"

#include <cstdio>
#include <cstdlib>
#include <memory>
#include <stdexcept>

namespace bench {
namespace {

namespace embedded = Orvandeil::FileIO::embedded;

std::unique_ptr<embedded::OpenFile> openUtf8(const std::string& path) {
    embedded::OpenRequest request;
    request.encoding = "UTF-8";
    return embedded::openFile(path, request);
}

void linesByOurs(Trial& trial, const std::string& path) {
    trial.time([&] {
        const auto file = openUtf8(path);
        embedded::Line line;
        while (embedded::readLine(*file, line, embedded::anyLength, embedded::Terminators::Kept)) {
            keep(line.text().data());
            trial.result(line.text());
        }
    });
}

// Hands every line to `use`.
template <class Use>
void linesByGetline(const std::string& path, Use use) {
    std::FILE* const file = std::fopen(path.c_str(), "r");
    char* line = nullptr;
    std::size_t room = 0;
    ssize_t length;
    while ((length = getline(&line, &room, file)) > 0)
        use(std::string_view(line, static_cast<std::size_t>(length)));
    std::free(line);
    std::fclose(file);
}

void linesByBytes(Trial& trial, const std::string& path) {
    trial.time([&] {
        linesByGetline(path, [&](std::string_view line) {
            keep(line.data());
            trial.result(line);
        });
    });
}

void linesByIcu(Trial& trial, const std::string& path) {
    const std::unique_ptr<UConverter, decltype(&ucnv_close)> converter(
        [] {
            UErrorCode status = U_ZERO_ERROR;
            return ucnv_open("UTF-8", &status);
        }(),
        ucnv_close);
    trial.time([&] {
        std::u16string text;
        linesByGetline(path, [&](std::string_view line) {
            text.resize(line.size());
            UErrorCode status = U_ZERO_ERROR;
            const std::int32_t units =
                ucnv_toUChars(converter.get(), text.data(), static_cast<std::int32_t>(text.size()),
                              line.data(), static_cast<std::int32_t>(line.size()), &status);
            keep(text.data());
            trial.result(std::u16string_view(text).substr(0, static_cast<std::size_t>(units)));
        });
    });
}

Job makeLinesJob(const Charset& charset, Context& context) {
    const std::string bytes = encoded(charset, textFor(charset, context.scaled(50000000)));
    const std::string path = context.file("lines.txt", bytes);
    std::vector<Contender> contenders = {
        {ours, [=](Trial& trial) { linesByOurs(trial, path); }},
        {"getline", [=](Trial& trial) { linesByBytes(trial, path); }},
        {"getline+icu", [=](Trial& trial) { linesByIcu(trial, path); }},
    };
    addPython(contenders, context, "python", {"lines", path});
    contenders.push_back({limit, [=](Trial& trial) { linesByBytes(trial, path); }});
    return perByte(bytes.size(), std::move(contenders));
}

}  // namespace

void addLinesJobs(JobList& jobs) {
    for (const Charset* charset : {&charsets[0], &charsets[1]}) {
        jobs.push_back({std::string("lines-") + charset->name,
                        [charset](Context& context) { return makeLinesJob(*charset, context); }});
    }
}

}  // namespace bench
