#pragma once

#include "fileio/export.h"

#include <cstddef>
#include <string>

struct vxConsoleSink;

// Text services of the host.

// Whether a line may break at this code unit: the blanks between words, line breaks included, but
// no no-break blank. A byte is asked about sign-extended, so that 0x80 to 0xFF are never blanks.
// The library may remember the answer for ASCII units: it must not change.
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

// Whether the host can convert the encoding of that canonical name.
FILEIO_API bool vxTextEncodingIsSupported(const char* canonicalName);

// The name of the character set that `count` bytes of the file seem to be written in, "UTF-8" when
// there is nothing to tell. What it has to say to the user goes to `console`.
FILEIO_API std::string vxTextDetectCharset(const char* bytes, std::size_t count,
                                           vxConsoleSink& console, const std::u16string& fileName);

// Reads one number by the host's number syntax from the start of [text, text + count), without
// regard to any locale, and stores the bytes consumed (0: no number there). A sign may stand in
// front; a value too large is an infinity, one too small is 0.
FILEIO_API double vxTextToDouble(const char* text, std::size_t count, std::size_t* consumed);
