#pragma once

#include <chrono>
#include <condition_variable>
#include <mutex>
#include <string>
#include <thread>
#include <unistd.h>

namespace Orvandeil::FileIO::embedded {

// While it lives, a terminal shows how far a long transfer has come: nothing at first, then after
// `delay` one line such as "reading f.bin: 1.2 GiB of 4.0 GiB", renewed every so often and erased
// at the end. The position is that of the descriptor `watched`; a thread of its own asks the system
// for it, so that the transfer itself does nothing for it. Not on a terminal it does nothing.
class ProgressLine {
public:
    using Delay = std::chrono::milliseconds;
    static constexpr Delay usualDelay{2000};

    ProgressLine(int watched, std::string action, int terminal = STDERR_FILENO,
                 Delay delay = usualDelay);
    ~ProgressLine();
    ProgressLine(const ProgressLine&) = delete;
    ProgressLine& operator=(const ProgressLine&) = delete;

private:
    void run();
    void show() const;
    void tell(const std::string& text) const;

    int descriptor;
    int output;
    Delay firstDelay;
    std::string what;
    bool done = false;
    std::mutex mutex;
    std::condition_variable ended;
    std::thread thread;
};

}  // namespace Orvandeil::FileIO::embedded
