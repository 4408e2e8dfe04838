#include "fileio/attributes/file_permission.h"

namespace Orvandeil::FileIO {

FilePermission::FilePermission() {
    generateFileSystemFormat();
}

FilePermission::FilePermission(const char* mode, bool constructionFlagValue) : FilePermission() {
    constructionFlag = constructionFlagValue;
    valid = FilePermission::Init(mode);
}

FilePermission& FilePermission::operator=(const char* mode) {
    CharAttrValidator::operator=(mode);
    return *this;
}

bool FilePermission::Init(const char* mode) {
    text = mode;
    pendingError = {};
    if (text.find_first_of("rwaWA") != 0) {
        AssignError(KESTRA::legacy_two_part::badpermission_vx());
        return false;
    }
    if (text.find_first_not_of("rwab+AWt") != std::string::npos) {
        AssignError(KESTRA::fopen::IncorrectFileMode());
        return false;
    }
    setFlags();
    if (int{read} + int{write} + int{append} != 1) {
        AssignError(KESTRA::fopen::ConflictingExclusiveFileModes());
        return false;
    }
    generateFileSystemFormat();
    return true;
}

void FilePermission::setFlags() {
    const auto has = [this](const char* letters) {
        return text.find_first_of(letters) != std::string::npos;
    };
    read = has("r");
    write = has("wW");
    append = has("aA");
    update = has("+");
    binary = has("b");
    textMode = has("t");
    autoFlush = !has("WA");
}

void FilePermission::Validate() const {
    if (pendingError) vxErrorRethrow(pendingError);
    CharAttrValidator::Validate();
}

void FilePermission::generateFileSystemFormat() {
    char* next = fileSystemFormat;
    if (read) {
        *next++ = 'r';
    } else if (write) {
        *next++ = 'w';
    } else if (append) {
        *next++ = 'a';
    }
    if (update) *next++ = '+';
    *next++ = 'b';
    *next = '\0';
    if (!textMode) return;
    if (const std::size_t first = text.find('t'); first != std::string::npos) text.erase(first, 1);
}

}  // namespace Orvandeil::FileIO
