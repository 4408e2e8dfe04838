#pragma once

#include <array>
#include <atomic>
#include <cstddef>
#include <cstdint>
#include <mutex>

#include <unicode/ucnv.h>

namespace Orvandeil::FileIO::detail {

// The characters of one or two bytes in an encoding that maps them one by one, as its converter
// answered when it was asked about each alone. Filled row by row at the first need, once in the
// process for each encoding; any number of threads may ask.
class ByteTable {
public:
    // No character: the converter has to look.
    static constexpr char16_t noUnit = 0xFFFF;
    static constexpr unsigned noBytes = 0;

    static const ByteTable& of(const UConverter* converter);

    explicit ByteTable(const UConverter* converter);
    ~ByteTable();
    ByteTable(const ByteTable&) = delete;
    ByteTable& operator=(const ByteTable&) = delete;

    // Whether bytes below 0x80 stand for themselves.
    bool isAsciiTransparent() const { return asciiTransparent; }
    char16_t unitOf(unsigned char byte) const { return singles[byte]; }
    char16_t unitOf(unsigned char lead, unsigned char trail) const {
        return rowOf(rowsByLead, lead, &ByteTable::decodeRow)[trail];
    }
    // 1 for a byte that begins a longer character, or none, else 0.
    unsigned isLead(unsigned char byte) const { return leads[byte]; }
    // The character of a lead and a trail if `two` is 1, and of `byte` alone if it is 0; noUnit
    // also for one that was not yet asked for.
    char16_t unitAt(unsigned char byte, unsigned char trail, unsigned two) const {
        const Row& row = *rowsByLead[byte].load(std::memory_order_acquire);
        const unsigned mask = 0U - two;
        return static_cast<char16_t>((row[trail] & mask) | (singles[byte] & ~mask));
    }
    // Below 0x100 one byte, else two, the first one high.
    unsigned bytesOf(char16_t unit) const {
        return rowOf(rowsByUnit, unit >> 8, &ByteTable::encodeRow)[unit & 0xFF];
    }

private:
    using Row = std::array<char16_t, 256>;
    using Rows = std::array<std::atomic<const Row*>, 256>;
    using FillRow = void (ByteTable::*)(unsigned, Row&) const;

    const Row& rowOf(Rows& rows, unsigned index, FillRow fill) const {
        const Row* const row = rows[index].load(std::memory_order_acquire);
        return row != &notAsked ? *row : addRow(rows, index, fill);
    }
    const Row& addRow(Rows& rows, unsigned index, FillRow fill) const;
    char16_t decode(const char* bytes, std::size_t count) const;
    void decodeRow(unsigned lead, Row& row) const;
    void encodeRow(unsigned high, Row& row) const;

    UConverter* asked;
    bool asciiTransparent = true;
    static const Row notAsked;  // all noUnit

    Row singles;
    std::array<std::uint8_t, 256> leads;
    mutable std::mutex filling;
    mutable Rows rowsByLead;
    mutable Rows rowsByUnit;
};

}  // namespace Orvandeil::FileIO::detail
