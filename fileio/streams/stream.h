#pragma once

#include "fileio/export.h"
#include "fileio/memory_operation_overloads.h"

#include <cstdarg>
#include <string>

#include <boost/noncopyable.hpp>

namespace Orvandeil::FileIO {

// A source or sink of bytes: an open file, a text in memory, the console. No operation throws for
// an I/O failure: it returns a short count or a status and records the cause in the error code.
// The order of the virtual operations is part of the binary interface.
class FILEIO_API stream : public fiMemoryOperationOverloads, private boost::noncopyable {
public:
    stream() = default;
    virtual ~stream();

    // Stores the position in bytes. 0, or non-zero with the error code set.
    virtual int getPosition(long& position) = 0;

    // Reads `count` elements of `elementSize` bytes. Returns the whole elements read, fewer at the
    // end of the data or on failure.
    virtual unsigned long GetNElements(unsigned long count, char* buffer,
                                       unsigned long elementSize) = 0;

    // Writes `count` elements of `elementSize` bytes. Returns the whole elements written.
    virtual unsigned long PutNElements(unsigned long count, const void* buffer,
                                       unsigned long elementSize) = 0;

    // Writes as C's vprintf formats. Returns the characters written, negative on failure.
    virtual int print(const char* format, std::va_list arguments) = 0;

    // Whether the end of the data has been reached (for files: the end-of-file indicator is set).
    virtual bool EndOfData() = 0;

    // Moves the read position back by `count` bytes; true when it did.
    virtual bool Rewind(unsigned long count) = 0;

    // Promises that the next print will need no more than `size` characters. Asked for only when
    // needsBufferSize() is true.
    virtual void setBufferSize(unsigned long size) = 0;
    virtual bool needsBufferSize() { return false; }

    // Read one number of at most `width` characters (negative: no limit) from the current
    // position, which is left behind its last character. `status` is written only when there is
    // something to tell: the error code after a failed read, 0 when no digits were found, -9 when
    // the text is no number; scanFloat also reads it, and sets 2147483647 after a number. `flag`
    // tells whether the field of an unsigned scan carried a minus sign. A stream that cannot be
    // read from returns 0 and leaves the status alone.
    virtual unsigned long scanOctal(long width, int& status, bool& flag) = 0;
    virtual unsigned long scanHex(long width, int& status, bool& flag) = 0;
    virtual unsigned long scanUnsignedInteger(long width, int& status, bool& flag) = 0;
    virtual long scanInteger(long width, int& status) = 0;
    virtual long scanIntegerCouldBeHex(long width, int& status) = 0;
    virtual double scanFloat(long width, int& status) = 0;

    // print() over the arguments that follow; its result.
    int printf(const char* format, ...) __attribute__((format(printf, 2, 3)));

    // 0 while nothing has failed; else errno, -1 when only the file's error indicator told, or a
    // code of the library's own. It stays through later successes.
    int getErrorCode() const { return errorCode; }

protected:
    int errorCode = 0;
};

}  // namespace Orvandeil::FileIO
