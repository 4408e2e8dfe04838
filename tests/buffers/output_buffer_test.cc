#include "fileio/buffers/output_buffer.h"

#include "embedded/services/array.h"
#include "embedded/services/memory.h"
#include "fileio/buffers/vx_data.h"
#include "tests/support/raised.h"

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <cstring>
#include <functional>
#include <random>
#include <vector>

#include <gtest/gtest.h>

namespace {

using namespace Orvandeil::FileIO;
using embedded::ArrayPtr;
using Units = std::vector<std::uint16_t>;

std::uint16_t unitAt(const void* element) {
    std::uint16_t unit;
    std::memcpy(&unit, element, sizeof unit);
    return unit;
}

Units contents(OutputBuffer& buffer) {
    Units units;
    buffer.ResetNext();
    while (const void* element = buffer.GetNext())
        units.push_back(unitAt(element));
    return units;
}

// A buffer of 16-bit elements, and what it should hold.
class BufferAndModel {
public:
    explicit BufferAndModel(unsigned seed)
        : random(seed), buffer(vxUINT16_CLASS, upTo(5), upTo(4), upTo(20)) {}

    void step() {
        const std::function<void()> steps[] = {
            [this] { fill(upTo(12)); },
            [this] { fill(upTo(12)); },
            [this] { appendConverted(); },
            [this] { appendAnother(); },
            [this] { appendItself(); },
            [this] { buffer.SetCurrentCapacity(upTo(40), upTo(1) == 0); },
            [this] { flip(); },
            [this] { rollBack(); },
            [this] { rollBack(); },
            [this] { takeAll(); },
        };
        steps[upTo(upTo(9))]();
        ASSERT_EQ(buffer.GetSize(), model.size());
        ASSERT_EQ(contents(buffer), model);
    }

private:
    std::size_t upTo(std::size_t most) { return random() % (most + 1); }
    std::uint16_t unit() { return static_cast<std::uint16_t>(random()); }

    void fill(std::size_t asked) {
        std::size_t n = asked;
        auto* room = static_cast<char*>(buffer.Allocate(n));
        ASSERT_EQ(n, asked);
        const std::size_t used = upTo(asked);
        for (std::size_t i = 0; i < asked; ++i) {
            const std::uint16_t value = unit();
            std::memcpy(room + i * sizeof value, &value, sizeof value);
            if (i < used) model.push_back(value);
        }
        buffer.SetLastChunkSize(used);
    }

    void appendConverted() {
        const double values[] = {-1, 2.5, 70000};
        const Units converted = {0, 3, 65535};
        const void* start = buffer.AppendData(vxDOUBLE_CLASS, values, 3);
        ASSERT_EQ(unitAt(start), 0);
        model.insert(model.end(), converted.begin(), converted.end());
        buffer.AppendScalar(static_cast<int>(upTo(9)) - 10);
        model.push_back(0);
    }

    void appendAnother() {
        OutputBuffer other(vxINT8_CLASS, 1, 1, 1);
        for (int i = 0; i < 30; ++i) {
            other.AppendScalar(i - 5);
            model.push_back(static_cast<std::uint16_t>(std::max(i - 5, 0)));
        }
        const void* end = buffer.AppendBuffer(other);
        ASSERT_EQ(unitAt(static_cast<const std::uint16_t*>(end) - 1), 24);
    }

    void appendItself() {
        buffer.AppendBuffer(buffer);
        const Units once = model;
        model.insert(model.end(), once.begin(), once.end());
        if (model.size() > 2000) takeAll();
    }

    void flip() {
        buffer.FlipBytes();
        ASSERT_EQ(buffer.GetNext(), nullptr);
        for (std::uint16_t& value : model)
            value = static_cast<std::uint16_t>(value << 8 | value >> 8);
    }

    void rollBack() {
        buffer.SetRollbackPoint();
        const Units before = model;
        const std::size_t fills = upTo(3);
        for (std::size_t i = 0; i < fills; ++i)
            fill(upTo(12));
        buffer.Rollback();
        model = fills == 0 ? Units() : before;
        if (upTo(1) == 0 || fills == 0) return;
        fill(upTo(12));
        buffer.Rollback();
        model = before;
    }

    void takeAll() {
        const boost::shared_ptr<void> block = buffer.Transfer();
        for (std::size_t i = 0; i < model.size(); ++i)
            ASSERT_EQ(unitAt(static_cast<std::uint16_t*>(block.get()) + i), model[i]);
        model.clear();
    }

    std::mt19937 random;
    OutputBuffer buffer;
    Units model;
};

TEST(OutputBuffer, HoldsWhatRandomOperationsPutIn) {
    const std::size_t blocks = embedded::liveBlockCount();
    for (unsigned seed = 0; seed < 300; ++seed) {
        BufferAndModel pair(seed);
        for (int i = 0; i < 100; ++i)
            ASSERT_NO_FATAL_FAILURE(pair.step()) << "seed " << seed << " step " << i;
    }
    EXPECT_EQ(embedded::liveBlockCount(), blocks);
}

TEST(OutputBuffer, NormalisesAndGrowsItsCapacity) {
    const struct {
        int line;
        std::size_t initial, min, max, first;
        std::vector<std::size_t> grown;
    } rows[] = {
        {__LINE__, 0, 0, 0, 1, {1, 1}},
        {__LINE__, 0, 4, 0, 4, {4, 4}},
        {__LINE__, 8, 2, 40, 8, {16, 32, 40, 40}},
        {__LINE__, 1, 6, 3, 1, {6, 6}},
        {__LINE__, SIZE_MAX, 1, SIZE_MAX, SIZE_MAX, {SIZE_MAX}},
    };
    for (const auto& row : rows) {
        OutputBuffer buffer(vxDOUBLE_CLASS, row.initial, row.min, row.max);
        EXPECT_EQ(buffer.GetCurrentCapacity(), row.first) << row.line;
        for (const std::size_t expected : row.grown)
            EXPECT_EQ(buffer.SetCurrentCapacity(0, true), expected) << row.line;
        const std::size_t min = std::max<std::size_t>(row.min, 1);
        EXPECT_EQ(buffer.SetCurrentCapacity(0, false), min) << row.line;
        std::size_t n = 5;
        buffer.Allocate(n);
        EXPECT_EQ(buffer.GetCurrentCapacity(), std::max<std::size_t>(min, 5)) << row.line;
    }
    OutputBuffer cells(vxCELL_CLASS, 1, 1, 1);
    EXPECT_EQ(cells.GetTypeSize(), 1u);
    EXPECT_EQ(cells.AppendData(vxDOUBLE_CLASS, "12345678", 1), nullptr);
    EXPECT_EQ(cells.GetSize(), 0u);
}

TEST(OutputBuffer, KeepsItsEndsStraight) {
    OutputBuffer buffer(vxUINT16_CLASS, 1, 1, 1);
    buffer.SetNextAfterLastElement();
    EXPECT_EQ(buffer.GetNext(), nullptr);
    EXPECT_EQ(buffer.TransferRaw(), nullptr);
    std::size_t n = 10;
    buffer.Allocate(n);
    buffer.SetLastChunkSize(3);
    EXPECT_EQ(buffer.GetSize(), 3u);
    buffer.SetLastChunkSize(3);  // once too often: takes away as much again
    EXPECT_EQ(buffer.GetSize(), 0u);
    buffer.SetLastChunkSize(1000);
    EXPECT_EQ(buffer.GetSize(), 10u);
    buffer.SetNextAfterLastElement();
    EXPECT_EQ(buffer.GetNext(), nullptr);
    buffer.AppendScalar(static_cast<unsigned short>(7));
    EXPECT_EQ(unitAt(buffer.GetNext()), 7);

    n = 0;
    OutputBuffer empty(vxUINT16_CLASS, 1, 1, 1);
    empty.Allocate(n);
    void* block = empty.TransferRaw();
    EXPECT_NE(block, nullptr);
    empty.FreeMem(block);
}

template <class T>
double appended(T value) {
    OutputBuffer buffer(vxDOUBLE_CLASS, 0, 0, 0);
    buffer.AppendScalar(value);
    return *static_cast<double*>(buffer.GetNext());
}

TEST(OutputBuffer, AppendsScalarsOfTheirOwnClass) {
    EXPECT_EQ(appended<int>(INT32_MIN), -0x1p31);
    EXPECT_EQ(appended<unsigned int>(UINT32_MAX), 0x1p32 - 1);
    EXPECT_EQ(appended<short>(-32768), -32768);
    EXPECT_EQ(appended<unsigned short>(65535), 65535);
    EXPECT_EQ(appended<long long>(INT64_MIN), -0x1p63);
    EXPECT_EQ(appended<unsigned long long>(1ull << 63), 0x1p63);
}

TEST(OutputBuffer, FlipsElementsOfEverySize) {
    const char bytes[] = "12345678";
    const struct {
        vxClassID classID;
        const char* flipped;
    } rows[] = {{vxINT8_CLASS, "12345678"},
                {vxCHAR_CLASS, "21436587"},
                {vxSINGLE_CLASS, "43218765"},
                {vxUINT64_CLASS, "87654321"}};
    for (const auto& row : rows) {
        OutputBuffer buffer(row.classID, 0, 0, 0);
        buffer.AppendData(row.classID, bytes, 8 / buffer.GetTypeSize());
        buffer.FlipBytes();
        const boost::shared_ptr<void> block = buffer.Transfer();
        EXPECT_EQ(std::memcmp(block.get(), row.flipped, 8), 0) << row.flipped;
    }
}

TEST(OutputBuffer, ShapesWhatItHandsOver) {
    const struct {
        int line;
        vxClassID classID;
        std::size_t count;
        std::vector<double> size;  // empty: unshaped
        bool countInBytes;
        std::size_t rows, columns;
    } rows[] = {
        {__LINE__, vxDOUBLE_CLASS, 0, {}, false, 0, 0},
        {__LINE__, vxDOUBLE_CLASS, 5, {}, false, 1, 5},
        {__LINE__, vxCHAR_CLASS, 5, {}, false, 1, 5},
        {__LINE__, vxDOUBLE_CLASS, 10, {4}, false, 4, 3},
        {__LINE__, vxDOUBLE_CLASS, 0, {4}, false, 0, 0},
        {__LINE__, vxDOUBLE_CLASS, 3, {9}, false, 3, 1},
        {__LINE__, vxDOUBLE_CLASS, 1, {9}, false, 1, 1},
        {__LINE__, vxDOUBLE_CLASS, 7, {HUGE_VAL}, false, 7, 1},
        {__LINE__, vxDOUBLE_CLASS, 4, {1, 4}, false, 4, 1},
        {__LINE__, vxDOUBLE_CLASS, 3, {4, 2}, false, 3, 1},
        {__LINE__, vxDOUBLE_CLASS, 5, {2, HUGE_VAL}, false, 2, 3},
        {__LINE__, vxDOUBLE_CLASS, 2, {0, 0}, false, 2, 1},
        {__LINE__, vxCHAR_CLASS, 5, {2}, false, 5, 1},
        {__LINE__, vxCHAR_CLASS, 5, {2, 3}, false, 2, 3},
        {__LINE__, vxINT8_CLASS, 10, {4}, true, 4, 3},
        {__LINE__, vxDOUBLE_CLASS, 10, {1, HUGE_VAL}, true, 2, 1},
        {__LINE__, vxUINT16_CLASS, 10, {2, 3}, true, 2, 3},
    };
    for (const auto& row : rows) {
        for (const std::size_t piece : {1u, 3u, 100u}) {
            OutputBuffer buffer(row.classID, 0, 1, 0);
            for (std::size_t i = 0; i < row.count; i += piece) {
                const Units ones(std::min(piece, row.count - i), 1);
                buffer.AppendData(vxUINT16_CLASS, ones.data(), ones.size());
            }
            const ArrayPtr size = embedded::makeDoubles(1, row.size.size(), row.size);
            const ArrayPtr array(row.size.empty() ? buffer.TransferArray()
                                                  : buffer.TransferArray(SizeAttribute(size.get()),
                                                                         row.countInBytes));
            EXPECT_EQ(vxArrayClassID(array.get()), row.classID) << row.line;
            EXPECT_EQ(vxArrayDimensions(array.get())[0], row.rows) << row.line;
            EXPECT_EQ(vxArrayDimensions(array.get())[1], row.columns) << row.line;
            for (std::size_t i = 0; i < row.rows * row.columns; ++i)
                EXPECT_EQ(VxData(array.get()).getIndexAs<double>(i), i < row.count) << row.line;
            EXPECT_EQ(buffer.GetSize(), 0u);
        }
    }
}

// Every operation that takes memory, on an empty buffer and on one of one and of several chunks,
// with each of its allocations failing in turn.
TEST(OutputBuffer, IsUnchangedWhenMemoryRunsOut) {
    const Units many(500, 9);
    const SizeAttribute size(embedded::makeScalar(7).get());
    OutputBuffer other(vxUINT16_CLASS, 1, 1, 1);
    other.AppendData(vxUINT16_CLASS, many.data(), many.size());
    const std::function<void(OutputBuffer&)> operations[] = {
        [&](OutputBuffer& b) { b.AppendData(vxUINT16_CLASS, many.data(), many.size()); },
        [&](OutputBuffer& b) { b.AppendBuffer(other); },
        [&](OutputBuffer& b) { b.FreeMem(b.TransferRaw()); },
        [&](OutputBuffer& b) { b.Transfer(); },
        [&](OutputBuffer& b) { ArrayPtr(b.TransferArray()); },
        [&](OutputBuffer& b) { ArrayPtr(b.TransferArray(size, false)); },
    };
    const std::size_t blocks = embedded::liveBlockCount();
    for (const auto& operation : operations) {
        for (const std::size_t chunks : {0u, 1u, 4u}) {
            bool failed = true;
            for (std::size_t nth = 1; failed; ++nth) {
                OutputBuffer buffer(vxUINT16_CLASS, 8, 8, 8);
                for (std::size_t i = 0; i < chunks; ++i)
                    buffer.AppendData(vxUINT16_CLASS, many.data() + i, i % 2 == 0 ? 5 : 100);
                const Units before = contents(buffer);
                const std::size_t capacity = buffer.GetCurrentCapacity();
                const embedded::FailingAllocation failure(nth);
                try {
                    operation(buffer);
                } catch (const embedded::OutOfMemoryError&) {
                    EXPECT_EQ(contents(buffer), before);
                    EXPECT_EQ(buffer.GetCurrentCapacity(), capacity);
                }
                failed = failure.happened();
            }
        }
    }
    EXPECT_EQ(embedded::liveBlockCount(), blocks);
}

TEST(OutputBuffer, RefusesSizesBeyondTheAddressSpace) {
    OutputBuffer buffer(vxDOUBLE_CLASS, 1, 1, 1);
    std::size_t asked = 4;
    buffer.Allocate(asked);
    for (std::size_t n : {SIZE_MAX, SIZE_MAX / 8 + 1}) {
        EXPECT_EQ(fileio_tests::raisedBy([&] { buffer.Allocate(n); }),
                  "KESTRA:legacy_two_part:p64bitsize");
        EXPECT_EQ(buffer.GetSize(), 4u);
    }
    buffer.SetLastChunkSize(3);
    EXPECT_EQ(buffer.GetSize(), 3u);
}

}  // namespace
