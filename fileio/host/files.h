#pragma once

#include "fileio/export.h"

#include <cstdio>
#include <string>

// Files by the names that the host gives them.

// A file name as bytes, as the system and messages want it.
FILEIO_API std::string vxFileNameToBytes(const std::u16string& name);

// Opens a file with a mode of the standard library's fopen. Null on failure, with errno set; the
// caller closes it with fclose.
FILEIO_API std::FILE* vxFileOpen(const std::u16string& name, const char* mode);
