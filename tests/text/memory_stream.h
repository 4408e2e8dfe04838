#pragma once

#include "fileio/text/tcodn_stream.h"

#include <algorithm>
#include <string>
#include <utility>
#include <vector>

namespace Orvandeil::FileIO {

// A transcoding stream over strings, whose transfers can be cut short.
class MemoryStream : public TcodnStream {
public:
    explicit MemoryStream(const std::string& encoding, std::string bytes = {})
        : TcodnStream(encoding), input(std::move(bytes)) {}

    using TcodnStream::CheckStatus;

    std::string input;
    std::size_t next = 0;
    std::size_t boundary = 0;  // no read goes across it
    std::string output;
    std::size_t outputLimit = std::string::npos;
    int writes = 0;
    std::string detected = "UTF-8";
    mutable std::vector<unsigned long> detections;

    int getPosition(long& position) override {
        position = static_cast<long>(next);
        return 0;
    }
    unsigned long GetNElements(unsigned long count, char* buffer, unsigned long) override {
        const std::size_t end = next < boundary ? boundary : input.size();
        count = std::min(count, end - next);
        input.copy(buffer, count, next);
        next += count;
        return count;
    }
    unsigned long PutNElements(unsigned long count, const void* buffer,
                               unsigned long elementSize) override {
        ++writes;
        const std::size_t room = (outputLimit - output.size()) / elementSize;
        const unsigned long taken = std::min(count, room);
        output.append(static_cast<const char*>(buffer), taken * elementSize);
        return taken;
    }
    int print(const char*, std::va_list) override { return -1; }
    bool EndOfData() override { return next == input.size(); }
    bool Rewind(unsigned long count) override {
        next -= count;
        return true;
    }
    void setBufferSize(unsigned long) override {}
    unsigned long scanOctal(long, int&, bool&) override { return 0; }
    unsigned long scanHex(long, int&, bool&) override { return 0; }
    unsigned long scanUnsignedInteger(long, int&, bool&) override { return 0; }
    long scanInteger(long, int&) override { return 0; }
    long scanIntegerCouldBeHex(long, int&) override { return 0; }
    double scanFloat(long, int&) override { return 0; }
    std::string DetectCharset(unsigned long startOffset) const override {
        detections.push_back(startOffset);
        return detected;
    }
};

}  // namespace Orvandeil::FileIO
