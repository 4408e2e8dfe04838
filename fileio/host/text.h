#pragma once

#include "fileio/export.h"

#include <cstddef>
#include <string>

// Text services of the host.

// Whether a line may break at this code unit: the blanks between words, line breaks included, but
// no no-break blank. A byte is asked about sign-extended, so that 0x80 to 0xFF are never blanks.
FILEIO_API bool qzu_isbreakablespace(char16_t unit);

// UTF-16 to the host's narrow encoding; what it cannot hold is substituted.
FILEIO_API std::string vxTextToNarrow(const char16_t* text, std::size_t units);

// Narrow text in the host's encoding to UTF-16; malformed bytes are substituted.
FILEIO_API std::u16string vxTextFromNarrow(const char* text, std::size_t bytes);

// Widens `count` ASCII bytes to UTF-16. False at the first byte above 0x7F; what `out` holds is
// then unspecified.
FILEIO_API bool vxTextWidenAscii(const char* text, std::size_t count, char16_t* out);

// The canonical name that the host uses for the encoding a converter calls `name`.
FILEIO_API std::string vxTextCanonicalEncodingName(const char* name);

// Reads one number by the host's number syntax from the start of [text, text + count), without
// regard to any locale, and stores the bytes consumed (0: no number there).
FILEIO_API double vxTextToDouble(const char* text, std::size_t count, std::size_t* consumed);
