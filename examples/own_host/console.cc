#include "fileio/host/console.h"

#include "examples/own_host/own_host.h"
#include "fileio/host/files.h"
#include "fileio/host/text.h"

#include <utility>
#include <vector>

// The console of this host is a screen in memory.
struct vxConsoleSink {
    std::string shown;
};

namespace own_host {
namespace {

std::vector<boost::shared_ptr<vxConsoleSink>>& redirections() {
    static std::vector<boost::shared_ptr<vxConsoleSink>> sinks;
    return sinks;
}

// Whatever goes to the output goes to the newest redirection.
std::string& destination(vxConsoleSink& sink) {
    const bool redirected = &sink == vxConsoleOutput().get() && !redirections().empty();
    return redirected ? redirections().back()->shown : sink.shown;
}

}  // namespace

std::string takeOutput() {
    return std::exchange(vxConsoleOutput()->shown, {});
}

std::string takeErrors() {
    return std::exchange(vxConsoleError()->shown, {});
}

}  // namespace own_host

using own_host::destination;
using own_host::redirections;

boost::shared_ptr<vxConsoleSink> vxConsoleOutput() {
    static const boost::shared_ptr<vxConsoleSink> sink(new vxConsoleSink);
    return sink;
}

boost::shared_ptr<vxConsoleSink> vxConsoleError() {
    static const boost::shared_ptr<vxConsoleSink> sink(new vxConsoleSink);
    return sink;
}

void vxConsoleWriteText(vxConsoleSink& sink, const char16_t* text, std::size_t units) {
    destination(sink) += vxTextToNarrow(text, units);
}

void vxConsoleWriteBytes(const char* bytes, std::size_t count) {
    destination(*vxConsoleOutput()).append(bytes, count);
}

int vxConsolePutString(const char* text) {
    destination(*vxConsoleOutput()) += text;
    return 0;
}

void vxConsoleFlush(vxConsoleSink&) {}  // nothing is held back

bool vxConsoleIsBad(const vxConsoleSink&) {
    return false;
}  // memory takes everything

void vxConsoleRedirectionPush(const boost::shared_ptr<vxConsoleSink>& target) {
    redirections().push_back(target);
}

void vxConsoleRedirectionPop() {
    redirections().pop_back();
}

void vxConsolePrintMessage(const char* text, std::size_t bytes) {
    vxConsoleError()->shown.append(text, bytes);
}

std::string vxFileNameToBytes(const std::u16string& name) {
    return vxTextToNarrow(name.data(), name.size());
}

std::FILE* vxFileOpen(const std::u16string& name, const char* mode) {
    return std::fopen(vxFileNameToBytes(name).c_str(), mode);
}
