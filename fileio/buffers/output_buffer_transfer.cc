#include "fileio/buffers/host_array.h"
#include "fileio/buffers/output_buffer.h"
#include "fileio/host/memory.h"

#include <algorithm>
#include <cstring>

namespace Orvandeil::FileIO {
namespace {

struct Shape {
    std::size_t rows;
    std::size_t columns;
};

// The rows of a filled shape: those asked for, as far as there are elements.
std::size_t rowsFor(const SizeAttribute& size, std::size_t count, vxClassID classID) {
    if (!size.isMatrix && classID == vxCHAR_CLASS) return count;
    // A shape without rows cannot hold the elements that there are.
    return std::max<std::size_t>(std::min(size.m, count), 1);
}

Shape shapeFor(std::size_t rows, std::size_t count, std::size_t divisor) {
    const std::size_t columns = count / divisor + (count % divisor != 0);
    // A single row becomes a column. This is on purpose.
    return rows == 1 ? Shape{columns, 1} : Shape{rows, columns};
}

detail::OwnedArray makeEmptyArray(vxClassID classID) {
    return detail::OwnedArray(vxCreateNumericMatrix(0, 0, classID, vxREAL));
}

}  // namespace

void* OutputBuffer::TransferRaw() {
    return chunks.empty() ? nullptr : takeBlock(GetSize());
}

boost::shared_ptr<void> OutputBuffer::Transfer() {
    // Freed without this buffer, which may be gone by then.
    return boost::shared_ptr<void>(TransferRaw(), vxMemoryFree);
}

void OutputBuffer::FreeMem(void* block) noexcept {
    vxMemoryFree(block);
}

vxArray* OutputBuffer::TransferArray() {
    const std::size_t count = GetSize();
    detail::OwnedArray array = makeEmptyArray(classID);
    if (count == 0) return emptied(array.release());
    if (classID != vxCHAR_CLASS) vxArraySetRows(array.get(), 1);
    vxArraySetColumns(array.get(), count);
    if (classID == vxCHAR_CLASS) vxArraySetRows(array.get(), 1);
    fillArray(array.get(), count);
    return array.release();
}

vxArray* OutputBuffer::TransferArray(const SizeAttribute& size, bool countInBytes) {
    const std::size_t count = GetSize();
    detail::OwnedArray array = makeEmptyArray(classID);
    if (count == 0) return emptied(array.release());
    const std::size_t rows = rowsFor(size, count, classID);
    const Shape shape = shapeFor(rows, count, countInBytes ? rows * typeSize : rows);
    vxArraySetColumns(array.get(), shape.columns);
    vxArraySetRows(array.get(), shape.rows);
    fillArray(array.get(), shape.rows * shape.columns);
    return array.release();
}

// What chunks there are have no elements.
vxArray* OutputBuffer::emptied(vxArray* array) {
    for (void* const chunk : chunks)
        vxMemoryFree(chunk);
    Clear();
    return array;
}

// A shape counted in bytes may have fewer elements than there are; the block keeps them all.
void OutputBuffer::fillArray(vxArray* array, std::size_t elements) {
    void* const block = takeBlock(std::max(elements, GetSize()));
    if (classID == vxDOUBLE_CLASS && elements == 1) vxArrayMarkScalar(array);
    vxArraySetData(array, block);
}

// All elements in one block of `elements` elements, zeros behind them, and an empty buffer. Nothing
// is changed before the only step that can fail.
void* OutputBuffer::takeBlock(std::size_t elements) {
    const std::size_t bytes = bytesOf(elements);
    const std::size_t usedBytes = GetSize() * typeSize;
    char* block = chunks.front();
    if (chunks.size() > 1) {
        block = joinChunks(bytes);
    } else if (elements != lastChunkRoom) {
        block = static_cast<char*>(vxMemoryReallocateOrRaise(block, bytes));
    }
    std::memset(block + usedBytes, 0, bytes - usedBytes);
    Clear();
    return block;
}

char* OutputBuffer::joinChunks(std::size_t bytes) {
    auto* const block = static_cast<char*>(vxMemoryAllocateOrRaise(bytes));
    char* end = block;
    for (std::size_t i = 0; i < chunks.size(); ++i) {
        const std::size_t chunkBytes = chunkCounts[i] * typeSize;
        std::memcpy(end, chunks[i], chunkBytes);
        end += chunkBytes;
        vxMemoryFree(chunks[i]);
    }
    return block;
}

}  // namespace Orvandeil::FileIO
