#pragma once

#include "fileio/export.h"

#include <cstddef>

#include <boost/shared_ptr.hpp>

// The host's console: two sinks, output and error, shared by everything that writes to them. Text
// comes as UTF-16, formatted numbers as bytes in the host's narrow encoding; what is written to
// one sink appears in the order of the calls.

struct vxConsoleSink;

FILEIO_API boost::shared_ptr<vxConsoleSink> vxConsoleOutput();
FILEIO_API boost::shared_ptr<vxConsoleSink> vxConsoleError();

// Writes `units` code units; a high surrogate at the end may be completed by the next call. The
// host cuts long texts into chunks and may look between them whether the user has interrupted
// (its own error then). A failure sets the sink's bad bit; a sink that is set to throw when it is
// bad raises std::ios_base::failure.
FILEIO_API void vxConsoleWriteText(vxConsoleSink& sink, const char16_t* text, std::size_t units);

// Writes `count` bytes, none of them NUL, to the console's output. 0 bytes are allowed.
FILEIO_API void vxConsoleWriteBytes(const char* bytes, std::size_t count);

// Writes a NUL-terminated text to the console's output. -1 on failure.
FILEIO_API int vxConsolePutString(const char* text);

// Hands what is buffered on. A failure sets the sink's bad bit.
FILEIO_API void vxConsoleFlush(vxConsoleSink& sink);
FILEIO_API bool vxConsoleIsBad(const vxConsoleSink& sink);

// From now on, until the matching pop, whatever goes to the console's output goes to `target`.
// Redirections nest.
FILEIO_API void vxConsoleRedirectionPush(const boost::shared_ptr<vxConsoleSink>& target);
FILEIO_API void vxConsoleRedirectionPop();

// Shows the user a message of `bytes` bytes about something that did not go well, but does not
// fail the operation. Best not where results are written.
FILEIO_API void vxConsolePrintMessage(const char* text, std::size_t bytes);
