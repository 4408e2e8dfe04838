#pragma once

#include "fileio/attributes/size_attribute.h"
#include "fileio/export.h"
#include "fileio/host/arrays.h"
#include "fileio/memory_operation_overloads.h"

#include <cstddef>

#include <boost/container/small_vector.hpp>
#include <boost/shared_ptr.hpp>

namespace Orvandeil::FileIO {

// Collects elements of one class whose number is not known beforehand, in chunks of host memory
// that never move, and hands them over in one piece at the end. All counts are elements.
//
// Filling: Allocate room, write into it, and tell with SetLastChunkSize how much of it was used.
// A buffer is handed over with one of the Transfer operations, and is empty and usable afterwards.
// Exhausted memory is the host's own error, sizes beyond 64 bits are
// "KESTRA:legacy_two_part:p64bitsize"; both leave the buffer as it was.
class FILEIO_API OutputBuffer : public fiMemoryOperationOverloads {
public:
    // Zero stands for: minChunk 1, initialCapacity minChunk, maxChunk minChunk.
    OutputBuffer(vxClassID cls, std::size_t initialCapacity, std::size_t minChunk,
                 std::size_t maxChunk);
    OutputBuffer(const OutputBuffer&) = delete;
    OutputBuffer& operator=(const OutputBuffer&) = delete;
    virtual ~OutputBuffer();

    // Sets the size of the next chunk to `n`, or, to grow, to twice the current one, at most
    // maxChunk; never below minChunk. Returns it.
    std::size_t SetCurrentCapacity(std::size_t n, bool grow);

    // Contiguous room for `n` elements, which count as used at once.
    void* Allocate(std::size_t& n);

    // Corrects the last Allocate to the `actual` number of elements filled. Once per Allocate.
    void SetLastChunkSize(std::size_t actual);

    std::size_t GetSize() const;
    // The elements that can still be allocated without new memory.
    std::size_t getFreeRoom() const {
        return chunks.empty() ? 0 : lastChunkRoom - chunkCounts.back();
    }
    std::size_t GetTypeSize() const { return typeSize; }
    vxClassID GetClassID() const { return classID; }
    std::size_t GetCurrentCapacity() const { return currentCapacity; }

    // A cursor over the elements, in order; GetNext gives null after the last one.
    void ResetNext();
    void* GetNext();
    void SetNextAfterLastElement();

    // Reverses the bytes of every element. Moves the cursor.
    void FlipBytes();

    // Forgets the chunks without freeing them.
    void Clear();

    // Rollback takes back everything allocated since SetRollbackPoint. It serves to undo what was
    // read one step too far, and leaves the mark where it is. Without an Allocate since the mark
    // was set it takes back everything there is.
    void SetRollbackPoint() { rollbackStart = nullptr; }
    void Rollback();

    // The elements as one block of host memory that the caller owns; null when there are no
    // chunks.
    void* TransferRaw();
    // The same, shared. The pointer may outlive the buffer.
    boost::shared_ptr<void> Transfer();
    // Frees a block handed over by TransferRaw.
    void FreeMem(void* block) noexcept;

    // A new array of all elements as one row (0 by 0 for none).
    vxArray* TransferArray();
    // A new array shaped as the size asks: its rows filled column by column, the last column padded
    // with zeros, no rows beyond the count. A size of one row gives a column: this is on purpose.
    // With `countInBytes` the rows are counted in bytes.
    vxArray* TransferArray(const SizeAttribute& size, bool countInBytes);

    // Append elements, converted to the buffer's class, in one contiguous run. AppendBuffer
    // returns the place behind the last element written, AppendData the run's first element.
    void* AppendBuffer(const OutputBuffer& other);
    void* AppendData(vxClassID cls, const void* data, std::size_t n);
    template <class T>
    void AppendScalar(T value);

private:
    friend struct LayoutProbe;

    std::size_t bytesOf(std::size_t elements) const;
    bool fitsLastChunk(std::size_t n) const;
    void makeRoomInLists();
    void openChunk(std::size_t n);
    void dropChunksFrom(std::size_t first);
    void* keepConverted(void* end);
    void* takeBlock(std::size_t elements);
    char* joinChunks(std::size_t bytes);
    vxArray* emptied(vxArray* array);
    void fillArray(vxArray* array, std::size_t elements);

    std::size_t minChunk;
    std::size_t maxChunk;
    std::size_t currentCapacity;
    std::size_t lastRequest = 0;
    boost::container::small_vector<char*, 2> chunks;
    boost::container::small_vector<std::size_t, 2> chunkCounts;
    std::size_t elementsBeforeLast = 0;
    vxClassID classID;
    std::size_t typeSize;
    void* rollbackStart = nullptr;
    std::size_t rollbackChunk = 0;
    std::size_t nextChunk = 0;
    std::size_t nextElement = 0;
    std::size_t lastChunkRoom = 0;  // elements that the last chunk really holds
};

extern template FILEIO_API void OutputBuffer::AppendScalar(int);
extern template FILEIO_API void OutputBuffer::AppendScalar(long long);
extern template FILEIO_API void OutputBuffer::AppendScalar(short);
extern template FILEIO_API void OutputBuffer::AppendScalar(unsigned int);
extern template FILEIO_API void OutputBuffer::AppendScalar(unsigned long long);
extern template FILEIO_API void OutputBuffer::AppendScalar(unsigned short);

}  // namespace Orvandeil::FileIO
