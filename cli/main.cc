#include "cli/code_error.h"
#include "cli/help.h"
#include "cli/suggestion.h"
#include "cli/usage_error.h"
#include "cli/verb.h"
#include "fileio/errors/code_list.h"
#include "fileio/text/conversion_size_error.h"

#include <exception>
#include <new>
#include <stdexcept>
#include <string>

namespace cli {
namespace {

using foundation::core::except::IMsgIDException;
using Arguments = std::span<char* const>;

const Verb& findVerb(std::string_view name) {
    std::vector<std::string_view> names;
    for (const Verb* verb : allVerbs()) {
        if (name == verb->name) return *verb;
        names.push_back(verb->name);
    }
    throw UsageError(unknownName("verb", name, names));
}

void checkOperandCount(const Verb& verb, std::size_t count) {
    if (count >= verb.leastOperands && count <= verb.mostOperands) return;
    throw UsageError(std::string(count < verb.leastOperands ? "too few" : "too many") +
                     " operands: fileio " + verb.name + " [options] " + verb.operands);
}

int printText(const std::string& text) {
    Report report(false);
    report.print(text);
    return report.finish();
}

// Whatever the library or its host raise becomes the report's error.
void runReporting(const Verb& verb, const CommandLine& line, Report& report) {
    namespace code = Orvandeil::FileIO::code;
    try {
        verb.run(line, report);
    } catch (const UsageError&) {
        throw;
    } catch (const CodeError& error) {
        report.fail(error.code, error.what());
    } catch (const IMsgIDException& error) {
        report.fail(error);
    } catch (const std::bad_alloc&) {
        report.failExhausted();
    } catch (const std::length_error&) {
        report.failExhausted();
    } catch (const Orvandeil::FileIO::ConversionSizeError& error) {
        report.fail(code::SizeTooBig, error.what());
    } catch (const std::exception& error) {
        report.fail(code::InternalError, error.what());
    }
}

int runVerb(const Verb& verb, Arguments arguments) {
    const std::vector<Option> options = optionsOf(verb);
    const CommandLine line(options, arguments);
    if (line.has("help")) return printText(verbHelp(verb));
    checkOperandCount(verb, line.operands().size());
    Report report(line.has("json"));
    runReporting(verb, line, report);
    return report.finish();
}

int run(Arguments arguments) {
    if (arguments.empty()) throw UsageError("a verb is needed; see fileio --help");
    const std::string_view first = arguments[0];
    if (first == "--help") return printText(programHelp());
    if (first == "--version") return printText(versionText());
    if (first.starts_with('-')) {
        throw UsageError("the first argument is a verb, --help or --version, not \"" +
                         std::string(first) + '"');
    }
    return runVerb(findVerb(first), arguments.subspan(1));
}

}  // namespace
}  // namespace cli

int main(int argc, char** argv) {
    try {
        return cli::run({argv + 1, argc < 1 ? 0 : static_cast<std::size_t>(argc) - 1});
    } catch (const cli::UsageError& error) {
        cli::printErrorLine(error.what());
        return cli::exitUsage;
    }
}
