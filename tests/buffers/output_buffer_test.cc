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
            [this] { fill(); },
            [this] { fill(); },
            [this] { appendConverted(); },
            [this] { appendAnother(); },
            [this] { appendItself(); },
            [this] { buffer.SetCurrentCapacity(upTo(40), upTo(1) == 0); },
            [this] { flip(); },
            [this] { rollBack(); },
            [this] { rollBack(); },
            [this] { takeAll(); }};
        steps[upTo(9)]();
        ASSERT_EQ(buffer.GetSize(), model.size());
        ASSERT_EQ(contents(buffer), model);
    }

private:
    std::size_t upTo(std::size_t most) { return random() % (most + 1); }

    void fill() {
        const std::size_t asked = upTo(12), used = upTo(asked);
        std::size_t n = asked;
        auto* room = static_cast<std::uint16_t*>(buffer.Allocate(n));
        ASSERT_EQ(n, asked);
        Units units(asked);
        std::generate(units.begin(), units.end(), std::ref(random));
        std::ranges::copy(units, room);
        model.insert(model.end(), units.begin(), units.begin() + static_cast<std::ptrdiff_t>(used));
        buffer.SetLastChunkSize(used);
    }

    void appendConverted() {
        const double values[] = {-1, 2.5, 70000};
        ASSERT_EQ(unitAt(buffer.AppendData(vxDOUBLE_CLASS, values, 3)), 0);
        buffer.AppendScalar(static_cast<int>(upTo(9)) - 10);
        model.insert(model.end(), {0, 3, 65535, 0});
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
            fill();
        buffer.Rollback();
        model = fills == 0 ? Units() : before;
        if (upTo(1) == 0 || fills == 0) return;
        fill();
        buffer.Rollback();
        model = before;
    }

    void takeAll() {
        const boost::shared_ptr<void> block = buffer.Transfer();
        const auto* units = static_cast<const std::uint16_t*>(block.get());
        ASSERT_EQ(Units(units, units + model.size()), model);
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
    // The capacities at first, grown, again, not grown, and behind a request of five elements.
    const auto capacities = [](std::size_t initial, std::size_t min, std::size_t max) {
        OutputBuffer buffer(vxDOUBLE_CLASS, initial, min, max);
        std::vector<std::size_t> found = {buffer.GetCurrentCapacity()};
        for (const bool grow : {true, true, true, false})
            found.push_back(buffer.SetCurrentCapacity(0, grow));
        std::size_t n = 5;
        buffer.Allocate(n);
        found.push_back(buffer.GetCurrentCapacity());
        return found;
    };
    using Sizes = std::vector<std::size_t>;
    EXPECT_EQ(capacities(0, 4, 0), (Sizes{4, 4, 4, 4, 4, 5}));
    EXPECT_EQ(capacities(8, 2, 40), (Sizes{8, 16, 32, 40, 2, 5}));
    EXPECT_EQ(capacities(1, 6, 3), (Sizes{1, 6, 6, 6, 6, 6}));
    EXPECT_EQ(capacities(SIZE_MAX, 1, SIZE_MAX),
              (Sizes{SIZE_MAX, SIZE_MAX, SIZE_MAX, SIZE_MAX, 1, 5}));
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

    OutputBuffer cells(vxCELL_CLASS, 1, 1, 1);
    EXPECT_EQ(cells.AppendData(vxDOUBLE_CLASS, "12345678", 1), nullptr);
    EXPECT_EQ(cells.GetSize(), 0u);
    void* block = cells.TransferRaw();
    EXPECT_NE(block, nullptr) << "there is a chunk, though nothing in it";
    cells.FreeMem(block);
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

// Hands `count` ones over, filled in by pieces: "rows x columns" of the array they become. It has
// zeros behind them.
std::string shapeOf(vxClassID classID, std::size_t count, std::vector<double> size,
                    bool countInBytes = false) {
    std::string shape;
    for (const std::size_t piece : {1u, 3u, 100u}) {
        OutputBuffer buffer(classID, 0, 1, 0);
        for (std::size_t i = 0; i < count; i += piece) {
            const Units ones(std::min(piece, count - i), 1);
            buffer.AppendData(vxUINT16_CLASS, ones.data(), ones.size());
        }
        const SizeAttribute asked(embedded::makeDoubles(1, size.size(), size).get());
        const ArrayPtr array(size.empty() ? buffer.TransferArray()
                                          : buffer.TransferArray(asked, countInBytes));
        EXPECT_EQ(vxArrayClassID(array.get()), classID);
        const std::size_t* lengths = vxArrayDimensions(array.get());
        for (std::size_t i = 0; i < lengths[0] * lengths[1]; ++i)
            EXPECT_EQ(VxData(array.get()).getIndexAs<double>(i), i < count);
        EXPECT_EQ(buffer.GetSize(), 0u);
        const std::string found = std::to_string(lengths[0]) + 'x' + std::to_string(lengths[1]);
        EXPECT_TRUE(shape.empty() || shape == found) << "in pieces of " << piece;
        shape = found;
    }
    return shape;
}

TEST(OutputBuffer, ShapesWhatItHandsOver) {
    EXPECT_EQ(shapeOf(vxDOUBLE_CLASS, 0, {}), "0x0");
    EXPECT_EQ(shapeOf(vxDOUBLE_CLASS, 5, {}), "1x5");
    EXPECT_EQ(shapeOf(vxDOUBLE_CLASS, 10, {4}), "4x3");
    EXPECT_EQ(shapeOf(vxDOUBLE_CLASS, 7, {HUGE_VAL}), "7x1");
    EXPECT_EQ(shapeOf(vxDOUBLE_CLASS, 4, {1, 4}), "4x1");
    EXPECT_EQ(shapeOf(vxDOUBLE_CLASS, 5, {2, HUGE_VAL}), "2x3");
    EXPECT_EQ(shapeOf(vxDOUBLE_CLASS, 2, {0, 0}), "2x1");
    EXPECT_EQ(shapeOf(vxCHAR_CLASS, 5, {2}), "5x1");
    EXPECT_EQ(shapeOf(vxCHAR_CLASS, 5, {2, 3}), "2x3");
    EXPECT_EQ(shapeOf(vxDOUBLE_CLASS, 10, {1, HUGE_VAL}, true), "2x1");
    EXPECT_EQ(shapeOf(vxUINT16_CLASS, 10, {2, 3}, true), "2x3");
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
        [&](OutputBuffer& b) { ArrayPtr(b.TransferArray(size, false)); }};
    const std::size_t blocks = embedded::liveBlockCount();
    const auto failsAt = [&](const auto& operation, std::size_t appends, std::size_t nth) {
        OutputBuffer buffer(vxUINT16_CLASS, 8, 8, 8);
        for (std::size_t i = 0; i < appends; ++i)
            buffer.AppendData(vxUINT16_CLASS, many.data() + i, i % 2 == 0 ? 5 : 100);
        const Units before = contents(buffer);
        const std::size_t capacity = buffer.GetCurrentCapacity();
        const embedded::FailingAllocation failure(nth);
        const std::string raised = fileio_tests::raisedBy([&] { operation(buffer); });
        EXPECT_EQ(raised, failure.happened() ? "KESTRA:nomem" : "");
        EXPECT_TRUE(raised.empty() || contents(buffer) == before);
        EXPECT_TRUE(raised.empty() || buffer.GetCurrentCapacity() == capacity);
        return failure.happened();
    };
    for (const auto& operation : operations) {
        for (const std::size_t appends : {0u, 1u, 4u})
            for (std::size_t nth = 1; failsAt(operation, appends, nth); ++nth) {
            }
    }
    EXPECT_EQ(embedded::liveBlockCount(), blocks);
}

}  // namespace
