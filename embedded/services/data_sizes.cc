#include "fileio/host/data_sizes.h"

#include <array>

namespace {

enum ByteOrder : int { LittleEndian = 0, BigEndian = 1 };

struct MachineFormat {
    const char* name;
    ByteOrder byteOrder;
};

// Indices 2 to 4 are not in use; the last entry stands for no valid format.
constexpr std::array<MachineFormat, 8> formats = {{
    {"little-endian", LittleEndian},
    {"big-endian", BigEndian},
    {nullptr, LittleEndian},
    {nullptr, LittleEndian},
    {nullptr, LittleEndian},
    {"little-endian.l64", LittleEndian},
    {"big-endian.l64", BigEndian},
    {nullptr, LittleEndian},
}};

constexpr int formatCount = static_cast<int>(formats.size());

// Bytes by data-type code: logical, char, four signed, four unsigned, single, double. Code 0 is
// not in use. The sizes are the same in every format.
constexpr std::array<int, 13> elementBytes = {0, 1, 2, 1, 2, 4, 8, 1, 2, 4, 8, 4, 8};

const MachineFormat* findFormat(int index) {
    if (index < 0 || index >= formatCount) return nullptr;
    return &formats[static_cast<std::size_t>(index)];
}

}  // namespace

int vxDataSizeNative() {
    return 0;
}

int vxDataSizeCount() {
    return formatCount;
}

const char* vxDataSizeName(int index) {
    const MachineFormat* format = findFormat(index);
    return format == nullptr ? nullptr : format->name;
}

int vxDataSizeEndian(int index) {
    const MachineFormat* format = findFormat(index);
    return format == nullptr ? LittleEndian : format->byteOrder;
}

int vxDataSizeConverted(int index, int type) {
    if (findFormat(index) == nullptr || type < 1 || type > 12) return 0;
    return elementBytes[static_cast<std::size_t>(type)];
}
