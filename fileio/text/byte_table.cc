#include "fileio/text/byte_table.h"

#include <map>
#include <memory>
#include <string>

#include <unicode/utf16.h>

namespace Orvandeil::FileIO::detail {

constinit const ByteTable::Row ByteTable::notAsked = [] {
    Row row;
    row.fill(noUnit);
    return row;
}();

const ByteTable& ByteTable::of(const UConverter* converter) {
    static std::mutex looking;
    // Never destroyed: streams may be used while the process ends.
    static auto& tables = *new std::map<std::string, std::unique_ptr<ByteTable>>;
    UErrorCode status = U_ZERO_ERROR;
    const char* const name = ucnv_getName(converter, &status);
    const std::lock_guard lock(looking);
    std::unique_ptr<ByteTable>& table = tables[name ? name : ""];
    if (!table) table = std::make_unique<ByteTable>(converter);
    return *table;
}

ByteTable::ByteTable(const UConverter* converter) {
    UErrorCode status = U_ZERO_ERROR;
    asked = ucnv_clone(converter, &status);
    // What it would substitute is no character of the encoding.
    ucnv_setFromUCallBack(asked, UCNV_FROM_U_CALLBACK_STOP, nullptr, nullptr, nullptr, &status);
    ucnv_setToUCallBack(asked, UCNV_TO_U_CALLBACK_STOP, nullptr, nullptr, nullptr, &status);
    for (unsigned byte = 0; byte < 256; ++byte) {
        rowsByLead[byte] = rowsByUnit[byte] = &notAsked;
        const char character = static_cast<char>(byte);
        singles[byte] = decode(&character, 1);
        leads[byte] = singles[byte] == noUnit;
        if (byte < 0x80 && singles[byte] != byte) asciiTransparent = false;
    }
}

ByteTable::~ByteTable() {
    for (const auto* rows : {&rowsByLead, &rowsByUnit}) {
        for (const auto& row : *rows) {
            if (row != &notAsked) delete row.load();
        }
    }
    ucnv_close(asked);
}

const ByteTable::Row& ByteTable::addRow(Rows& rows, unsigned index, FillRow fill) const {
    const std::lock_guard lock(filling);
    const Row* const known = rows[index].load(std::memory_order_relaxed);
    if (known != &notAsked) return *known;
    auto row = std::make_unique<Row>();
    (this->*fill)(index, *row);
    rows[index].store(row.get(), std::memory_order_release);
    return *row.release();
}

// Bytes that the converter keeps for what may follow are no character by themselves.
char16_t ByteTable::decode(const char* bytes, std::size_t count) const {
    if (!asked) return noUnit;
    char16_t units[8];
    char16_t* target = units;
    const char* const end = bytes + count;
    UErrorCode status = U_ZERO_ERROR;
    ucnv_resetToUnicode(asked);
    ucnv_toUnicode(asked, &target, std::end(units), &bytes, end, nullptr, false, &status);
    const bool isOne = U_SUCCESS(status) && target - units == 1 && bytes == end &&
                       ucnv_toUCountPending(asked, &status) == 0;
    return isOne && !U16_IS_SURROGATE(units[0]) ? units[0] : noUnit;
}

void ByteTable::decodeRow(unsigned lead, Row& row) const {
    // Two bytes of which the first stands for a character are none together.
    row.fill(noUnit);
    if (singles[lead] != noUnit) return;
    for (unsigned trail = 0; trail < 256; ++trail) {
        const char bytes[] = {static_cast<char>(lead), static_cast<char>(trail)};
        row[trail] = decode(bytes, 2);
    }
}

void ByteTable::encodeRow(unsigned high, Row& row) const {
    row.fill(noBytes);
    for (unsigned low = 0; asked && low < 256; ++low) {
        const auto unit = static_cast<char16_t>(high << 8 | low);
        char bytes[8];
        char* target = bytes;
        const char16_t* source = &unit;
        UErrorCode status = U_ZERO_ERROR;
        ucnv_resetFromUnicode(asked);
        ucnv_fromUnicode(asked, &target, std::end(bytes), &source, source + 1, nullptr, false,
                         &status);
        if (U_FAILURE(status) || ucnv_fromUCountPending(asked, &status) != 0) continue;
        const auto byteAt = [&bytes](int i) { return static_cast<unsigned char>(bytes[i]); };
        // Two bytes of which the first is zero would look like one; the converter writes those.
        if (target - bytes == 1) row[low] = byteAt(0);
        if (target - bytes == 2 && byteAt(0) != 0)
            row[low] = static_cast<char16_t>(byteAt(0) << 8 | byteAt(1));
    }
}

}  // namespace Orvandeil::FileIO::detail
