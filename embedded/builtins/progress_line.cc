#include "embedded/builtins/progress_line.h"

#include <cstdio>
#include <system_error>
#include <utility>

#include <sys/stat.h>

namespace Orvandeil::FileIO::embedded {
namespace {

constexpr std::chrono::milliseconds renewal{200};
constexpr char eraseLine[] = "\r\x1B[K";

std::string amount(off_t bytes) {
    constexpr const char* units[] = {"bytes", "KiB", "MiB", "GiB", "TiB", "PiB", "EiB"};
    auto value = static_cast<double>(bytes);
    std::size_t unit = 0;
    while (value >= 1024) {
        value /= 1024;
        ++unit;
    }
    char text[32];
    std::snprintf(text, sizeof text, "%.*f %s", unit == 0 ? 0 : 1, value, units[unit]);
    return text;
}

}  // namespace

ProgressLine::ProgressLine(int watched, std::string action, int terminal, Delay delay)
    : descriptor(watched), output(terminal), firstDelay(delay), what(std::move(action)) {
    if (isatty(output) == 0) return;
    try {
        thread = std::thread(&ProgressLine::run, this);
    } catch (const std::system_error&) {
        return;  // without a thread there is no line, and nothing else changes
    }
}

ProgressLine::~ProgressLine() {
    if (!thread.joinable()) return;
    {
        const std::lock_guard lock(mutex);
        done = true;
    }
    ended.notify_one();
    thread.join();
}

void ProgressLine::run() {
    std::unique_lock lock(mutex);
    const auto isDone = [this] { return done; };
    if (ended.wait_for(lock, firstDelay, isDone)) return;
    do {
        show();
    } while (!ended.wait_for(lock, renewal, isDone));
    tell(eraseLine);
}

void ProgressLine::show() const {
    const off_t position = lseek(descriptor, 0, SEEK_CUR);
    if (position < 0) return tell(eraseLine + what);
    std::string line = eraseLine + what + ": " + amount(position);
    struct stat status = {};
    const bool hasSize = fstat(descriptor, &status) == 0 && status.st_size > position;
    if (hasSize) line += " of " + amount(status.st_size);
    tell(line);
}

void ProgressLine::tell(const std::string& text) const {
    [[maybe_unused]] const ssize_t written = ::write(output, text.data(), text.size());
}

}  // namespace Orvandeil::FileIO::embedded
