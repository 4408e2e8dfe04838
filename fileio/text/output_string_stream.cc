#include "fileio/text/output_string_stream.h"

#include "fileio/constants.h"
#include "fileio/host/memory.h"
#include "fileio/text/piecewise_format.h"

#include <algorithm>
#include <climits>
#include <cstring>
#include <utility>

namespace Orvandeil::FileIO {

outputStringStream::outputStringStream(const std::string& encoding) : TcodnStream(encoding) {}

outputStringStream::~outputStringStream() {
    vxMemoryFree(data);
}

int outputStringStream::getPosition(long& position) {
    position = cursor - data;
    return 0;
}

unsigned long outputStringStream::GetNElements(unsigned long, char*, unsigned long) {
    return 0;
}

unsigned long outputStringStream::PutNElements(unsigned long count, const void* source,
                                               unsigned long elementSize) {
    unsigned long bytes = 0;
    if (__builtin_mul_overflow(count, elementSize, &bytes)) vxMemoryRaiseExhausted();
    EnsureSpace(bytes);
    if (bytes != 0) std::memcpy(cursor, source, bytes);
    cursor += bytes;
    return count;
}

int outputStringStream::print(const char* format, std::va_list arguments) {
    long written = 0;
    const auto put = [this, &written](const char* text, std::size_t count) {
        const int taken = PutASCIIString(text, static_cast<int>(count));
        written += taken;
        // More than asked is a byte-order mark in front.
        return static_cast<std::size_t>(taken) >= count;
    };
    const int length = detail::formatPiecewise(put, printScratch, format, arguments);
    return length < 0 ? length : static_cast<int>(std::min<long>(written, INT_MAX));
}

bool outputStringStream::EndOfData() {
    return false;
}

bool outputStringStream::Rewind(unsigned long count) {
    cursor -= std::min(count, static_cast<unsigned long>(cursor - data));
    return true;
}

// A promise about what is coming, never a size to allocate.
void outputStringStream::setBufferSize(unsigned long size) {
    bufferSize = size;
}

unsigned long outputStringStream::scanOctal(long, int&, bool&) {
    return 0;
}
unsigned long outputStringStream::scanHex(long, int&, bool&) {
    return 0;
}
unsigned long outputStringStream::scanUnsignedInteger(long, int&, bool&) {
    return 0;
}
long outputStringStream::scanInteger(long, int&) {
    return 0;
}
long outputStringStream::scanIntegerCouldBeHex(long, int&) {
    return 0;
}
double outputStringStream::scanFloat(long, int&) {
    return 0;
}

std::string outputStringStream::DetectCharset(unsigned long) const {
    return "UTF-16";
}

void outputStringStream::Reset() {
    data = nullptr;
    capacity = 0;
    cursor = nullptr;
    mark = nullptr;
}

void* outputStringStream::transferBuffer() {
    const auto used = static_cast<unsigned long>(cursor - data);
    if (capacity > used) ResizeTo(used);
    void* const block = data;
    Reset();
    return block;
}

void outputStringStream::EnsureSpace(unsigned long need) {
    if (capacity - static_cast<unsigned long>(cursor - data) >= need) return;
    unsigned long wanted = 0;
    if (__builtin_add_overflow(need, capacity, &wanted)) vxMemoryRaiseExhausted();
    unsigned long grown = capacity != 0 ? capacity : constants::firstOutputBlockBytes;
    while (grown < wanted) {
        if (__builtin_mul_overflow(grown, 2UL, &grown)) vxMemoryRaiseExhausted();
    }
    ResizeTo(grown);
}

void outputStringStream::ResizeTo(unsigned long newCapacity) {
    const auto cursorOffset = std::min(static_cast<unsigned long>(cursor - data), newCapacity);
    const auto markOffset = std::min(static_cast<unsigned long>(mark - data), newCapacity);
    if (newCapacity != 0) {
        data = static_cast<char*>(vxMemoryReallocateOrRaise(data, newCapacity));
    } else {
        // Nothing left is no block at all.
        vxMemoryFree(std::exchange(data, nullptr));
    }
    capacity = newCapacity;
    cursor = data + cursorOffset;
    mark = data + markOffset;
}

}  // namespace Orvandeil::FileIO
