#include "embedded/builtins/scan.h"

#include "benchmarks/field_limits.h"
#include "benchmarks/host_values.h"
#include "benchmarks/huge_block.h"
#include "benchmarks/peers.h"
#include "embedded/builtins/open_close.h"

#include <cstdlib>
#include <cstring>
#include <fstream>
#include <memory>
#include <sstream>

namespace bench {
namespace {

namespace embedded = Orvandeil::FileIO::embedded;

enum class Kind { Integers, ShortReals, Reals, Words };

// A family of fields in one text.
struct Fields {
    const char* name;
    const char16_t* format;
    const char* fscanfFormat;
    int perCall;  // fields that it stores
    Kind kind;
    const char* delimiter;  // as NumPy and R are told
    std::string (*text)(std::size_t count);
};

template <class Append>
std::string generated(std::size_t count, Append append) {
    Random random;
    std::string text;
    for (std::size_t i = 0; i < count; ++i)
        append(text, random, i);
    return text;
}

std::string integerLines(std::size_t count) {
    return generated(count, [](std::string& text, Random& random, std::size_t) {
        text += std::to_string(random.integer(-1000000, 1000000)) + '\n';
    });
}

std::string integerPairs(std::size_t count) {
    return generated(count, [](std::string& text, Random& random, std::size_t i) {
        text += std::to_string(random.integer(-1000000, 1000000)) + (i % 2 == 0 ? ',' : '\n');
    });
}

std::string realLines(std::size_t count, const char* format) {
    return generated(count, [format](std::string& text, Random& random, std::size_t) {
        char line[64];
        std::snprintf(line, sizeof line, format, random.uniform(-1000, 1000));
        text += line;
    });
}

std::string shortReals(std::size_t count) {
    return realLines(count, "%.2f\n");
}

std::string longReals(std::size_t count) {
    return realLines(count, "%.17g\n");
}

std::string words(std::size_t count, char separator) {
    return generated(count, [separator](std::string& text, Random& random, std::size_t) {
        for (std::int64_t left = random.integer(2, 10); left > 0; --left)
            text += static_cast<char>('a' + random.integer(0, 25));
        text += separator;
    });
}

std::string wordLines(std::size_t count) {
    return words(count, '\n');
}

std::string wordList(std::size_t count) {
    return words(count, ',');
}

constexpr Fields families[] = {
    {"int", u"%d", "%d", 1, Kind::Integers, "blank", integerLines},
    {"pairs", u"%d,%d", "%d,%d", 2, Kind::Integers, ",", integerPairs},
    {"short", u"%f", "%lf", 1, Kind::ShortReals, "blank", shortReals},
    {"17", u"%f", "%lf", 1, Kind::Reals, "blank", longReals},
    {"words", u"%s", "%63s", 1, Kind::Words, "blank", wordLines},
    {"set", u"%[^,],", "%63[^,],", 1, Kind::Words, ",", wordList},
};

struct ScanInput {
    Fields fields;
    std::size_t count;
    std::string text;
    std::string path;
};
using Input = std::shared_ptr<const ScanInput>;

Input makeInput(const Fields& fields, Context& context) {
    const std::size_t count = context.scaled(1000000);
    std::string text = fields.text(count);
    std::string path = context.file("scanned.txt", text);
    return std::make_shared<ScanInput>(ScanInput{fields, count, std::move(text), std::move(path)});
}

void oursFromFile(Trial& trial, const ScanInput& input) {
    embedded::OpenRequest request;
    request.encoding = "UTF-8";
    const auto file = embedded::openFile(input.path, request);
    const embedded::ScanResult result = trial.time([&] {
        return embedded::scan(*file, input.fields.format, Orvandeil::FileIO::SizeAttribute());
    });
    resultOfArray(trial, *result.array);
}

struct FileCloser {
    void operator()(std::FILE* file) const { std::fclose(file); }
};
using File = std::unique_ptr<std::FILE, FileCloser>;

// Times `read`, which fills a new block and returns the number of its elements.
template <class Element, class Read>
void intoNewBlock(Trial& trial, std::size_t room, Read read) {
    std::size_t count = 0;
    const auto block = trial.time([&] {
        auto fresh = std::make_unique<HugeBlock>(room * sizeof(Element));
        count = read(fresh->template as<Element>());
        keep(fresh->template as<Element>());
        return fresh;
    });
    if constexpr (std::is_same_v<Element, char16_t>) {
        trial.result(std::u16string_view(block->template as<Element>(), count));
    } else {
        trial.resultOf(block->template as<Element>(), count);
    }
}

template <class Number>
std::size_t numbersByFscanf(std::FILE* file, const Fields& fields, double* out) {
    double* const begin = out;
    Number first;
    Number second;
    if (fields.perCall == 1) {
        while (std::fscanf(file, fields.fscanfFormat, &first) == 1)
            *out++ = first;
    } else {
        while (std::fscanf(file, fields.fscanfFormat, &first, &second) == 2) {
            *out++ = first;
            *out++ = second;
        }
    }
    return static_cast<std::size_t>(out - begin);
}

std::size_t wordsByFscanf(std::FILE* file, const Fields& fields, char* out) {
    char* const begin = out;
    while (std::fscanf(file, fields.fscanfFormat, out) == 1)
        out += std::strlen(out);
    return static_cast<std::size_t>(out - begin);
}

void byFscanf(Trial& trial, const ScanInput& input) {
    const File file(std::fopen(input.path.c_str(), "r"));
    const Fields& fields = input.fields;
    if (fields.kind == Kind::Words) {
        intoNewBlock<char>(trial, input.text.size() + 1,
                           [&](char* out) { return wordsByFscanf(file.get(), fields, out); });
    } else if (fields.kind == Kind::Integers) {
        intoNewBlock<double>(trial, input.count, [&](double* out) {
            return numbersByFscanf<int>(file.get(), fields, out);
        });
    } else {
        intoNewBlock<double>(trial, input.count, [&](double* out) {
            return numbersByFscanf<double>(file.get(), fields, out);
        });
    }
}

template <class Number>
std::size_t numbersByStream(std::istream& in, bool isPairs, double* out) {
    double* const begin = out;
    Number value;
    while (in >> value) {
        *out++ = value;
        if (isPairs && in.peek() == ',') in.ignore();
    }
    return static_cast<std::size_t>(out - begin);
}

std::size_t wordsByStream(std::istream& in, bool isList, char* out) {
    char* const begin = out;
    std::string word;
    while (isList ? static_cast<bool>(std::getline(in, word, ',')) : static_cast<bool>(in >> word))
        out = std::copy(word.begin(), word.end(), out);
    return static_cast<std::size_t>(out - begin);
}

void byStream(Trial& trial, const ScanInput& input, std::istream& in) {
    const bool hasCommas = *input.fields.delimiter == ',';
    if (input.fields.kind == Kind::Words) {
        intoNewBlock<char>(trial, input.text.size(),
                           [&](char* out) { return wordsByStream(in, hasCommas, out); });
    } else if (input.fields.kind == Kind::Integers) {
        intoNewBlock<double>(trial, input.count,
                             [&](double* out) { return numbersByStream<int>(in, hasCommas, out); });
    } else {
        intoNewBlock<double>(trial, input.count, [&](double* out) {
            return numbersByStream<double>(in, hasCommas, out);
        });
    }
}

void byStrto(Trial& trial, const ScanInput& input) {
    intoNewBlock<double>(trial, input.count, [&](double* out) {
        double* const begin = out;
        const char* next = input.text.c_str();
        while (*next != '\0') {
            char* behind = nullptr;
            *out++ = input.fields.kind == Kind::Integers
                         ? static_cast<double>(std::strtol(next, &behind, 10))
                         : std::strtod(next, &behind);
            next = behind + 1;
        }
        return static_cast<std::size_t>(out - begin);
    });
}

// Source: a std::FILE* or a std::string_view.
template <class Source>
void byLimit(Trial& trial, const ScanInput& input, Source source) {
    if (input.fields.kind == Kind::Words) {
        intoNewBlock<char16_t>(trial, input.text.size(),
                               [&](char16_t* out) { return wordsOf(source, out); });
    } else if (input.fields.kind == Kind::Integers) {
        intoNewBlock<double>(trial, input.count,
                             [&](double* out) { return integersOf(source, out); });
    } else if (input.fields.kind == Kind::ShortReals) {
        intoNewBlock<double>(trial, input.count,
                             [&](double* out) { return shortRealsOf(source, out); });
    } else {
        intoNewBlock<double>(trial, input.count, [&](double* out) { return realsOf(source, out); });
    }
}

void addInterpreters(std::vector<Contender>& contenders, Context& context, const ScanInput& input) {
    const std::string delimiter = input.fields.delimiter;
    if (input.fields.kind == Kind::Words) {
        addPython(contenders, context, "numpy", {"scan_words", input.path, delimiter});
        addR(contenders, context, {"scanWords", input.path, delimiter});
        return;
    }
    const bool isWhole = input.fields.kind == Kind::Integers;
    addPython(contenders, context, "numpy",
              {"scan", input.path, delimiter, isWhole ? "int64" : "float64", "float64"});
    addR(contenders, context,
         {"scanNumbers", input.path, delimiter, isWhole ? "integer" : "numeric"});
}

Job makeFileJob(const Fields& fields, Context& context) {
    const Input input = makeInput(fields, context);
    std::vector<Contender> contenders = {
        {ours, [=](Trial& trial) { oursFromFile(trial, *input); }},
        {"fscanf", [=](Trial& trial) { byFscanf(trial, *input); }},
        {"iostream",
         [=](Trial& trial) {
             std::ifstream in(input->path);
             byStream(trial, *input, in);
         }},
    };
    addInterpreters(contenders, context, *input);
    contenders.push_back({limit, [=](Trial& trial) {
                              const File file(std::fopen(input->path.c_str(), "r"));
                              byLimit(trial, *input, file.get());
                          }});
    return perElement(input->count, std::move(contenders));
}

Job makeTextJob(const Fields& fields, Context& context) {
    const Input input = makeInput(fields, context);
    std::vector<Contender> contenders = {
        {ours, [=](Trial& trial) { scanBytes(trial, input->text, input->fields.format); }},
        {"iostream",
         [=](Trial& trial) {
             std::istringstream in(input->text);
             byStream(trial, *input, in);
         }},
    };
    if (fields.kind != Kind::Words)
        contenders.push_back({"strto", [=](Trial& trial) { byStrto(trial, *input); }});
    contenders.push_back(
        {limit, [=](Trial& trial) { byLimit(trial, *input, std::string_view(input->text)); }});
    return perElement(input->count, std::move(contenders));
}

}  // namespace

void addScanJobs(JobList& jobs) {
    for (const Fields& fields : families) {
        const std::string name = std::string("scan-") + fields.name;
        jobs.push_back(
            {name + ".file", [fields](Context& context) { return makeFileJob(fields, context); }});
        jobs.push_back(
            {name + ".text", [fields](Context& context) { return makeTextJob(fields, context); }});
    }
}

}  // namespace bench
