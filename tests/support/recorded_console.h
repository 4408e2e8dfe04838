#pragma once

#include "embedded/services/console.h"

#include <string>

namespace support {

// Keeps what one of the console's sinks is given, for as long as it lives.
struct RecordedConsole : Orvandeil::FileIO::embedded::ConsoleTarget {
    explicit RecordedConsole(const boost::shared_ptr<vxConsoleSink>& sink)
        : replacement(sink, *this) {}

    bool write(std::string_view bytes) override {
        if (!fails) text += bytes;
        return !fails;
    }
    bool flush() override {
        ++flushes;
        return !fails;
    }

    std::string text;
    int flushes = 0;
    bool fails = false;

private:
    Orvandeil::FileIO::embedded::ConsoleReplacement replacement;
};

}  // namespace support
