#include "fileio/attributes/machine_format.h"

#include "fileio/host/data_sizes.h"

#include <algorithm>
#include <string_view>

namespace Orvandeil::FileIO {
namespace {

char lowerAscii(char letter) {
    return letter >= 'A' && letter <= 'Z' ? static_cast<char>(letter - 'A' + 'a') : letter;
}

bool equalIgnoringCase(std::string_view a, std::string_view b) {
    return std::equal(a.begin(), a.end(), b.begin(), b.end(),
                      [](char x, char y) { return lowerAscii(x) == lowerAscii(y); });
}

int invalidIndex() {
    return vxDataSizeCount() - 1;
}

int indexOfLongName(std::string_view name) {
    if (equalIgnoringCase(name, "native")) return vxDataSizeNative();
    for (int index = 0; index < invalidIndex(); ++index) {
        const char* known = vxDataSizeName(index);
        if (known != nullptr && equalIgnoringCase(name, known)) return index;
    }
    return invalidIndex();
}

}  // namespace

MachineFormat::MachineFormat() : dataSizeType(vxDataSizeNative()) {}

MachineFormat::MachineFormat(const char* name) : MachineFormat() {
    valid = MachineFormat::Init(name);
}

MachineFormat& MachineFormat::operator=(const char* name) {
    CharAttrValidator::operator=(name);
    return *this;
}

bool MachineFormat::Init(const char* name) {
    const std::string_view given = name;
    // Kept on purpose: a blank is refused like any unknown letter, but changes nothing.
    if (given == " ") return false;
    if (given.empty()) {
        dataSizeType = invalidIndex();
    } else if (given.size() == 1) {
        dataSizeType = indexOfLetter(lowerAscii(given.front()));
    } else {
        dataSizeType = indexOfLongName(given);
    }
    return dataSizeType != invalidIndex();
}

int MachineFormat::indexOfLetter(char letter) {
    if (letter == 'n') return vxDataSizeNative();
    const std::size_t place = std::string_view(m_FormatMap).find(letter);
    return place == std::string_view::npos ? invalidIndex() : static_cast<int>(place) - 1;
}

void MachineFormat::Validate() const {
    if (!valid) vxErrorByNumber(errorMessageNumber);
}

}  // namespace Orvandeil::FileIO
