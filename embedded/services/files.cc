#include "fileio/host/files.h"

#include "fileio/host/text.h"

#include <cerrno>

std::string vxFileNameToBytes(const std::u16string& name) {
    return vxTextToNarrow(name.data(), name.size());
}

std::FILE* vxFileOpen(const std::u16string& name, const char* mode) {
    // The system would take the name to end at a NUL, and open another file.
    if (name.find(u'\0') != std::u16string::npos) {
        errno = ENOENT;
        return nullptr;
    }
    return std::fopen(vxFileNameToBytes(name).c_str(), mode);
}
