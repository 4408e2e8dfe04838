#include "fileio/buffers/output_buffer.h"

#include "fileio/buffers/byte_order.h"
#include "fileio/buffers/element_conversion.h"
#include "fileio/constants.h"
#include "fileio/errors/identifiers.h"
#include "fileio/host/memory.h"
#include "fileio/host/messages.h"

#include <algorithm>
#include <bit>
#include <cstdint>
#include <limits>
#include <new>
#include <numeric>

namespace Orvandeil::FileIO {
namespace {

// The class that holds values of an integer type, by its size and sign.
template <class Integer>
constexpr vxClassID classOfInteger() {
    constexpr int sizeStep = 2 * (std::bit_width(sizeof(Integer)) - 1);
    return static_cast<vxClassID>(vxINT8_CLASS + sizeStep + std::is_unsigned_v<Integer>);
}

}  // namespace

OutputBuffer::OutputBuffer(vxClassID cls, std::size_t initialCapacity, std::size_t smallestChunk,
                           std::size_t largestChunk)
    : minChunk(std::max<std::size_t>(smallestChunk, 1)),
      maxChunk(largestChunk == 0 ? minChunk : largestChunk),
      currentCapacity(initialCapacity == 0 ? minChunk : initialCapacity),
      classID(cls),
      typeSize(fiPkGetSizeFromClassID(cls)) {}

OutputBuffer::~OutputBuffer() {
    for (char* chunk : chunks) {
        vxMemoryFree(chunk);
    }
}

std::size_t OutputBuffer::SetCurrentCapacity(std::size_t n, bool grow) {
    if (!grow) {
        currentCapacity = n;
    } else if (currentCapacity > maxChunk / 2) {
        currentCapacity = maxChunk;
        lastRequest = maxChunk;
    } else {
        currentCapacity *= 2;
    }
    currentCapacity = std::max(currentCapacity, minChunk);
    return currentCapacity;
}

void* OutputBuffer::Allocate(std::size_t& n) {
    if (!fitsLastChunk(n)) openChunk(n);
    char* const room = chunks.back() + chunkCounts.back() * typeSize;
    chunkCounts.back() += n;
    lastRequest = n;
    if (rollbackStart == nullptr) {
        rollbackStart = room;
        rollbackChunk = chunks.size() - 1;
    }
    return room;
}

void OutputBuffer::SetLastChunkSize(std::size_t actual) {
    if (chunks.empty()) return;
    std::size_t& count = chunkCounts.back();
    if (actual >= lastRequest) {
        count += std::min(actual - lastRequest, lastChunkRoom - count);
    } else {
        count -= std::min(lastRequest - actual, count);
    }
}

std::size_t OutputBuffer::GetSize() const {
    return chunkCounts.empty() ? 0 : elementsBeforeLast + chunkCounts.back();
}

void OutputBuffer::ResetNext() {
    nextChunk = 0;
    nextElement = 0;
}

// At the end it stays in the last chunk, where elements may still be added.
void* OutputBuffer::GetNext() {
    while (nextChunk < chunks.size() && nextElement >= chunkCounts[nextChunk]) {
        if (nextChunk + 1 == chunks.size()) return nullptr;
        ++nextChunk;
        nextElement = 0;
    }
    return nextChunk < chunks.size() ? chunks[nextChunk] + nextElement++ * typeSize : nullptr;
}

void OutputBuffer::SetNextAfterLastElement() {
    ResetNext();
    if (chunks.empty()) return;
    nextChunk = chunks.size() - 1;
    nextElement = chunkCounts.back();
}

void OutputBuffer::FlipBytes() {
    for (std::size_t i = 0; i < chunks.size(); ++i) {
        detail::flipElements(chunks[i], typeSize, chunkCounts[i]);
    }
    SetNextAfterLastElement();
}

void OutputBuffer::Clear() {
    chunks.clear();
    chunkCounts.clear();
    elementsBeforeLast = 0;
    rollbackStart = nullptr;
    rollbackChunk = 0;
    lastChunkRoom = 0;
}

void OutputBuffer::Rollback() {
    if (rollbackStart == nullptr) {
        // On purpose everything, not nothing, though nothing was allocated since the mark.
        dropChunksFrom(0);
        return;
    }
    char* const base = chunks[rollbackChunk];
    const std::size_t usedBefore = chunkCounts[rollbackChunk];
    if (rollbackChunk + 1 < chunks.size()) {
        dropChunksFrom(rollbackChunk + 1);
        // How much the chunk really holds is forgotten; what it held is safe.
        lastChunkRoom = usedBefore;
    }
    chunkCounts.back() =
        static_cast<std::size_t>(static_cast<char*>(rollbackStart) - base) / typeSize;
}

void* OutputBuffer::AppendBuffer(const OutputBuffer& other) {
    std::size_t left = other.GetSize();
    void* end = Allocate(left);
    // Counting down keeps out what Allocate has just added when a buffer is appended to itself.
    for (std::size_t i = 0; i < other.chunks.size() && end != nullptr; ++i) {
        const std::size_t count = std::min(left, other.chunkCounts[i]);
        end = AssignToVoidBuffer(classID, end, other.classID, other.chunks[i], count);
        left -= count;
    }
    return keepConverted(end);
}

void* OutputBuffer::AppendData(vxClassID cls, const void* data, std::size_t n) {
    void* const start = Allocate(n);
    void* const end = keepConverted(AssignToVoidBuffer(classID, start, cls, data, n));
    return end == nullptr ? nullptr : start;
}

template <class T>
void OutputBuffer::AppendScalar(T value) {
    AppendData(classOfInteger<T>(), &value, 1);
}

template FILEIO_API void OutputBuffer::AppendScalar(int);
template FILEIO_API void OutputBuffer::AppendScalar(long long);
template FILEIO_API void OutputBuffer::AppendScalar(short);
template FILEIO_API void OutputBuffer::AppendScalar(unsigned int);
template FILEIO_API void OutputBuffer::AppendScalar(unsigned long long);
template FILEIO_API void OutputBuffer::AppendScalar(unsigned short);

std::size_t OutputBuffer::bytesOf(std::size_t elements) const {
    if (elements > std::numeric_limits<std::size_t>::max() / typeSize) {
        vxErrMsgId(KESTRA::legacy_two_part::p64bitsize());
    }
    return elements * typeSize;
}

// By what the chunk really holds: the current capacity may have been set since.
bool OutputBuffer::fitsLastChunk(std::size_t n) const {
    return !chunks.empty() && n <= getFreeRoom();
}

// One more entry can then be added without an error.
void OutputBuffer::makeRoomInLists() {
    if (chunks.size() < chunks.capacity() && chunks.size() < chunkCounts.capacity()) return;
    try {
        chunks.reserve(2 * chunks.size() + 1);
        chunkCounts.reserve(2 * chunks.size() + 1);
    } catch (const std::bad_alloc&) {
        vxMemoryRaiseExhausted();
    }
}

// Opens a chunk for `n` elements at least. Beyond that it grows with the buffer, up to a limit, so
// that appending one by one does not need a chunk for every few elements.
void OutputBuffer::openChunk(std::size_t n) {
    const std::size_t capacity = std::max(n, minChunk);
    const std::size_t reserve = std::min(GetSize(), constants::reservedChunkBytes / typeSize);
    const std::size_t room = std::max(capacity, reserve);
    const std::size_t bytes = bytesOf(room);
    makeRoomInLists();
    auto* const chunk = static_cast<char*>(vxMemoryAllocateOrRaise(bytes));
    SetCurrentCapacity(n, false);
    elementsBeforeLast = GetSize();
    chunks.push_back(chunk);
    chunkCounts.push_back(0);
    lastChunkRoom = room;
}

void OutputBuffer::dropChunksFrom(std::size_t first) {
    std::for_each(chunks.begin() + static_cast<std::ptrdiff_t>(first), chunks.end(), vxMemoryFree);
    chunks.resize(first);
    chunkCounts.resize(first);
    const auto last = first == 0 ? chunkCounts.end() : chunkCounts.end() - 1;
    elementsBeforeLast = std::accumulate(chunkCounts.begin(), last, std::size_t{0});
    lastChunkRoom = 0;
}

// Takes the last Allocate back when its elements could not be converted, which null tells.
void* OutputBuffer::keepConverted(void* end) {
    if (end == nullptr) SetLastChunkSize(0);
    return end;
}

}  // namespace Orvandeil::FileIO
