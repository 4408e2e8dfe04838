#include "embedded/services/console.h"

#include "fileio/host/text.h"

#include <algorithm>
#include <cstdio>
#include <cstring>
#include <ios>
#include <string>
#include <utility>

#include <unicode/utf16.h>

namespace Orvandeil::FileIO::embedded {
namespace {

// Units turned into UTF-8 at once.
constexpr std::size_t chunkUnits = 4096;

class StandardTarget : public ConsoleTarget {
public:
    explicit StandardTarget(std::FILE* standardFile) : file(standardFile) {}
    bool write(std::string_view bytes) override {
        return std::fwrite(bytes.data(), 1, bytes.size(), file) == bytes.size();
    }
    bool flush() override { return std::fflush(file) == 0; }

private:
    std::FILE* file;
};

}  // namespace

ConsoleTarget::~ConsoleTarget() = default;

ConsoleReplacement::ConsoleReplacement(const boost::shared_ptr<vxConsoleSink>& replacedSink,
                                       ConsoleTarget& target)
    : sink(replacedSink) {
    sink->endText();
    oldTarget = std::exchange(sink->target, &target);
    oldBad = std::exchange(sink->bad, false);
    oldThrowsWhenBad = std::exchange(sink->throwsWhenBad, false);
}

ConsoleReplacement::~ConsoleReplacement() {
    sink->endText();
    sink->target = oldTarget;
    sink->bad = oldBad;
    sink->throwsWhenBad = oldThrowsWhenBad;
}

}  // namespace Orvandeil::FileIO::embedded

using namespace Orvandeil::FileIO::embedded;

vxConsoleSink::~vxConsoleSink() {
    endText();
}

void vxConsoleSink::writeText(const char16_t* text, std::size_t units) {
    std::u16string whole;
    if (highSurrogate != 0) whole += std::exchange(highSurrogate, u'\0');
    whole.append(text, units);
    if (!whole.empty() && U16_IS_LEAD(whole.back())) {
        highSurrogate = whole.back();
        whole.pop_back();
    }
    if (!target->write(vxTextToNarrow(whole.data(), whole.size()))) bad = true;
}

void vxConsoleSink::writeBytes(std::string_view bytes) {
    if (bytes.empty()) return;
    endText();
    if (!target->write(bytes)) bad = true;
}

void vxConsoleSink::flush() {
    if (!target->flush()) bad = true;
}

void vxConsoleSink::endText() {
    if (highSurrogate == 0) return;
    const char16_t unit = std::exchange(highSurrogate, u'\0');
    if (!target->write(vxTextToNarrow(&unit, 1))) bad = true;
}

vxConsoleSink& vxConsoleSink::destination() {
    return redirections.empty() ? *this : *redirections.back();
}

const vxConsoleSink& vxConsoleSink::destination() const {
    return redirections.empty() ? *this : *redirections.back();
}

boost::shared_ptr<vxConsoleSink> vxConsoleOutput() {
    static StandardTarget target(stdout);
    static const boost::shared_ptr<vxConsoleSink> sink(new vxConsoleSink(target));
    return sink;
}

boost::shared_ptr<vxConsoleSink> vxConsoleError() {
    static StandardTarget target(stderr);
    static const boost::shared_ptr<vxConsoleSink> sink(new vxConsoleSink(target));
    return sink;
}

void vxConsoleWriteText(vxConsoleSink& sink, const char16_t* text, std::size_t units) {
    vxConsoleSink& to = sink.destination();
    for (std::size_t done = 0; done < units; done += chunkUnits) {
        to.writeText(text + done, std::min(chunkUnits, units - done));
    }
    if (to.bad && to.throwsWhenBad) throw std::ios_base::failure("the console cannot be written");
}

void vxConsoleWriteBytes(const char* bytes, std::size_t count) {
    vxConsoleOutput()->destination().writeBytes({bytes, count});
}

int vxConsolePutString(const char* text) {
    vxConsoleSink& to = vxConsoleOutput()->destination();
    const bool badBefore = std::exchange(to.bad, false);
    to.writeBytes(text);
    const bool failed = to.bad;
    to.bad = failed || badBefore;
    return failed ? -1 : 0;
}

void vxConsoleFlush(vxConsoleSink& sink) {
    sink.destination().flush();
}

bool vxConsoleIsBad(const vxConsoleSink& sink) {
    return sink.destination().bad;
}

void vxConsoleRedirectionPush(const boost::shared_ptr<vxConsoleSink>& target) {
    vxConsoleOutput()->redirections.push_back(target);
}

void vxConsoleRedirectionPop() {
    vxConsoleOutput()->redirections.pop_back();
}

void vxConsolePrintMessage(const char* text, std::size_t bytes) {
    vxConsoleError()->writeBytes({text, bytes});
}
