#include "benchmarks/context.h"
#include "benchmarks/host_values.h"
#include "benchmarks/print_formats.h"

#include <cstring>
#include <memory>
#include <sstream>
#include <stdexcept>

#include <fmt/compile.h>

namespace bench {
namespace {

namespace embedded = Orvandeil::FileIO::embedded;

struct TextInput {
    std::vector<std::string> texts;  // the arguments
    std::vector<double> codes;       // or their characters as numbers
    std::vector<ArrayPtr> arrays;    // as the library gets them
    std::vector<const vxArray*> arguments;
    std::u16string format;
    const char* separator;
    std::size_t elements;
    std::unique_ptr<char[]> narrow;
    std::unique_ptr<char16_t[]> wide;
    std::vector<std::u16string> wideTexts;
};
using Input = std::shared_ptr<TextInput>;

Input withTexts(std::vector<std::string> texts, const std::u16string& format,
                const char* separator) {
    auto input = std::make_shared<TextInput>();
    std::size_t room = 1;
    for (const std::string& text : texts) {
        room += text.size() + 1;
        input->wideTexts.emplace_back(text.begin(), text.end());
        input->arrays.push_back(embedded::makeChars(input->wideTexts.back()));
        input->arguments.push_back(input->arrays.back().get());
    }
    input->texts = std::move(texts);
    input->format = format;
    input->separator = separator;
    input->narrow.reset(new char[room]());
    input->wide.reset(new char16_t[room]());
    return input;
}

std::string letters(Random& random, std::int64_t count) {
    std::string text;
    for (; count > 0; --count)
        text += static_cast<char>('a' + random.integer(0, 25));
    return text;
}

Input wordInput(Context& context) {
    Random random;
    std::vector<std::string> words(context.scaled(1000000));
    for (std::string& word : words)
        word = letters(random, random.integer(2, 10));
    Input input = withTexts(std::move(words), u"%s\n", "\n");
    input->elements = input->texts.size();
    return input;
}

Input longInput(Context& context) {
    Random random;
    const std::size_t count = context.scaled(10000000);
    Input input = withTexts({letters(random, static_cast<std::int64_t>(count))}, u"%s", "");
    input->elements = count;
    return input;
}

Input codeInput(Context& context) {
    const std::size_t count = context.scaled(1000000);
    Input input = withTexts({}, u"%s", "");
    input->codes = integers(count, 'a', 'z');
    input->arrays.push_back(embedded::makeDoubles(1, count, input->codes));
    input->arguments.push_back(input->arrays.back().get());
    input->narrow.reset(new char[count + 1]());
    input->wide.reset(new char16_t[count]());
    input->elements = count;
    return input;
}

// Appends every argument to the narrow block.
template <class AppendText, class AppendCode>
void intoNarrow(Trial& trial, const TextInput& input, AppendText appendText,
                AppendCode appendCode) {
    char* const begin = input.narrow.get();
    const char* const end = trial.time([&] {
        char* out = begin;
        for (const std::string& text : input.texts)
            out = appendText(out, text);
        for (const double code : input.codes)
            out = appendCode(out, static_cast<char>(code));
        keep(begin);
        return out;
    });
    trial.result(std::string_view(begin, static_cast<std::size_t>(end - begin)));
}

void bySprintf(Trial& trial, const TextInput& input) {
    const char* const format = *input.separator == '\n' ? "%s\n" : "%s";
    intoNarrow(
        trial, input,
        [format](char* out, const std::string& text) {
            return out + std::sprintf(out, format, text.c_str());
        },
        [](char* out, char code) { return out + std::sprintf(out, "%c", code); });
}

void byFmt(Trial& trial, const TextInput& input) {
    intoNarrow(
        trial, input,
        [&input](char* out, const std::string& text) {
            return fmt::format_to(out, FMT_COMPILE("{}{}"), text, input.separator);
        },
        [](char* out, char code) { return fmt::format_to(out, FMT_COMPILE("{}"), code); });
}

void byStream(Trial& trial, const TextInput& input) {
    std::ostringstream out;
    trial.time([&] {
        for (const std::string& text : input.texts)
            out << text << input.separator;
        for (const double code : input.codes)
            out << static_cast<char>(code);
    });
    trial.result(out.view());
}

char16_t* copyChecked(const std::u16string& text, char16_t* out) {
    const char16_t* const from = text.data();
    const std::size_t count = text.size();
    char16_t all = 0;
    for (std::size_t i = 0; i < count; ++i) {
        all |= from[i];
        out[i] = from[i];
    }
    if (all > 0x7F) throw std::runtime_error("text is not ASCII");
    return out + count;
}

// Copies to UTF-16 whose characters and numbers are checked to be what they should.
std::size_t copyAll(const TextInput& input) {
    char16_t* out = input.wide.get();
    for (const std::u16string& text : input.wideTexts) {
        out = copyChecked(text, out);
        if (*input.separator != '\0') *out++ = static_cast<char16_t>(*input.separator);
    }
    for (const double code : input.codes) {
        const auto unit = static_cast<char16_t>(static_cast<int>(code));
        if (unit != code) throw std::runtime_error("a number is no character");
        *out++ = unit;
    }
    keep(input.wide.get());
    return static_cast<std::size_t>(out - input.wide.get());
}

Job makeJob(const Input& input) {
    std::vector<Contender> contenders = {
        {ours, [=](Trial& trial) { printToBlock(trial, input->format, input->arguments); }},
        {"sprintf", [=](Trial& trial) { bySprintf(trial, *input); }},
        {"fmt", [=](Trial& trial) { byFmt(trial, *input); }},
        {"iostream", [=](Trial& trial) { byStream(trial, *input); }},
        {limit,
         [=](Trial& trial) {
             const std::size_t units = trial.time([&] { return copyAll(*input); });
             trial.result(std::u16string_view(input->wide.get(), units));
         }},
    };
    return perElement(input->elements, std::move(contenders));
}

}  // namespace

void addPrintTextJobs(JobList& jobs) {
    jobs.push_back({"print-words", [](Context& context) { return makeJob(wordInput(context)); }});
    jobs.push_back({"print-text", [](Context& context) { return makeJob(longInput(context)); }});
    jobs.push_back({"print-codes", [](Context& context) { return makeJob(codeInput(context)); }});
}

}  // namespace bench
