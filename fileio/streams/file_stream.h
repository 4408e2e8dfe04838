#pragma once

#include "fileio/buffers/output_buffer.h"
#include "fileio/export.h"
#include "fileio/streams/file_read_buffer.h"
#include "fileio/streams/recent_bytes.h"
#include "fileio/text/tcodn_stream.h"

#include <cstdarg>
#include <cstddef>
#include <cstdio>
#include <memory>
#include <string>
#include <string_view>

namespace Orvandeil::FileIO {

class CarryByte;
class FilePermission;

namespace detail {
struct IntegerField;
struct IntegerScan;
}  // namespace detail

// A stream over an open standard-library file. It owns neither the file nor the permission that
// the file was opened with: both must outlive it, and the caller closes the file.
//
// A failed operation records its cause in the error code: errno, else -1 when the file's error
// indicator is set, else 0. So a read that meets the plain end of the file records 0. The standard
// library forbids switching between reading and writing without a positioning call (ISO C,
// 7.21.5.3); that call is the caller's.
class FILEIO_API fileStream : public TcodnStream {
public:
    // `encoding` is as in TcodnStream; an encoding given is checked by CheckStreamEncoding, except
    // on the process's standard streams. `name` serves messages and detection.
    fileStream(std::FILE* openFile, const std::string& encoding, FilePermission& openedWith,
               std::u16string name);
    ~fileStream() override;

    int getPosition(long& position) override;

    // An incomplete last element is consumed, but not counted. An element size of 0 reads nothing.
    unsigned long GetNElements(unsigned long count, char* buffer,
                               unsigned long elementSize) override;
    // Read at most `count` elements, or all the rest of the file, into a buffer whose elements have
    // `elementSize` bytes. Memory is asked for as the file can fill it, whatever the count.
    unsigned long GetNElements(unsigned long count, OutputBuffer& buffer,
                               unsigned long elementSize);
    unsigned long GetNElements(OutputBuffer& buffer, unsigned long elementSize);
    unsigned long PutNElements(unsigned long count, const void* buffer,
                               unsigned long elementSize) override;
    // The standard library's bytes, whatever the encoding.
    int print(const char* format, std::va_list arguments) override;
    bool EndOfData() override;
    // Undoes the read just made. Where the file cannot seek, the bytes of one character at most are
    // pushed back.
    bool Rewind(unsigned long count) override;
    void setBufferSize(unsigned long size) override;

    // Numbers are read from the bytes as they stand, behind the six blanks of the C locale. The
    // whole field is taken, but of a field without a width only the first 22 digits behind the
    // sign, the leading zeros and the prefix count, of a wider one than 24 the first 24 characters.
    // A field without digits gives back all that was read of it, and its status is 0 unless the
    // read failed. scanFloat reads "inf" and "nan" (status -1 for a near miss, which is given back)
    // and else what C's fscanf reads for "%le", which may leave the position behind a near miss.
    unsigned long scanOctal(long width, int& status, bool& flag) override;
    unsigned long scanHex(long width, int& status, bool& flag) override;
    unsigned long scanUnsignedInteger(long width, int& status, bool& flag) override;
    long scanInteger(long width, int& status) override;
    long scanIntegerCouldBeHex(long width, int& status) override;
    double scanFloat(long width, int& status) override;

    // For scans in place: the next bytes, as far as the file has been read, and taking those before
    // `next` as numbers.
    std::string_view bytesToScan() const { return detail::bytesReadAhead(file); }
    void takeScanned(const char* next);

    // "UTF-8" when the file is empty, too large for detection (see DetectedCharSet), cannot be
    // opened a second time or has nothing from `startOffset` on; else the host's answer for its
    // bytes from there on. Error code and position stay as they are.
    std::string DetectCharset(unsigned long startOffset) const override;

    // Appends one line, terminator included, to a buffer of class char, and tells how it ended: 1
    // with one line feed or carriage return, 2 with the pair of them, 0 with the end of the data or
    // after `maxCharacters` code points. -1 is no limit, another limit below 1 reads nothing. The
    // end-of-file indicator is set when nothing is left behind the line.
    virtual int GetLine(long maxCharacters, OutputBuffer& out);

    // The same, without a limit, for a line that lies with its terminator, and with something
    // behind it, in what the file has read ahead: returns its units. 0, and nothing is taken, for
    // any other line, a longer one than `room` and streams of other classes.
    std::size_t takeLineAhead(char16_t* units, std::size_t room, int& result);

    // Moves to a position in bytes. 0, or non-zero with the error code set.
    virtual int setPosition(long position);

    // The bytes in the file, without those that the standard library still buffers. False, 0 and
    // the error code set when the file has no size to tell.
    virtual bool getFileSize(long& size);
    virtual bool isFileOpen() const;

    // Hands buffered bytes to the system. 0, or non-zero with the error code set. It does not
    // settle the carry byte.
    virtual int flush();

    // Whether this is a console.
    virtual bool isScreen() const;

    // Clears the file's error and end-of-file indicators and the error code.
    virtual void clearError();

    // Warns with "KESTRA:iofun:UnsupportedEncoding" when the host cannot convert the encoding.
    virtual void CheckStreamEncoding();

    static bool getFileSize(std::FILE* file, long& size);

    // Looks one byte ahead, so that EndOfData() tells whether a byte is left.
    void checkForEndOfFile();

    // The byte at the current position, which stays; 0 on a stream opened by a permission to write
    // (there is none to merge with). 0, or 1 with the error code set: -5 when the file was opened
    // neither for writing nor for update, -33 (unless there is an older error), -34, -35 when
    // getting the position, reading or going back failed.
    int GetCurrentByteInStream(unsigned char* byte);

    // From this size in bytes on, files are not examined by DetectCharset; -1 is no limit. Taken
    // from QZ_FOPEN_CHARSET_DETECT_LIMIT at the first use in the process.
    long DetectedCharSet() const;

    CarryByte& getCarryByte() { return *carryByte; }
    // The bytes written by whole PutNElements and print.
    unsigned long getBytesWritten() const { return bytesWritten; }

protected:
    // Records the cause of a failed call. errno must have been 0 before that call.
    void recordFailure();

private:
    friend struct LayoutProbe;
    friend class detail::AsciiOutput;
    friend class detail::UnitsAhead;

    unsigned long readByte(char& byte);
    int peekByte(unsigned char& byte);
    std::size_t roomForRead(OutputBuffer& buffer, unsigned long elementSize,
                            bool lastCameShort) const;
    unsigned long readInto(OutputBuffer& buffer, std::size_t& room, unsigned long elementSize);
    long takeOfLine(long limit, OutputBuffer& out, int& result);
    int completeTerminator(char16_t terminator, OutputBuffer& out);
    void beginScan();
    detail::IntegerField scanField(const detail::IntegerScan& operation, long width, int& status);
    double scanNumber(long width, int sign, int& status);

    std::FILE* file;
    FilePermission* permission;
    std::u16string fileName;

protected:
    unsigned long bytesWritten = 0;

private:
    unsigned char lastByteRead = 0;  // what Rewind(1) pushes back; 0: nothing
    std::unique_ptr<CarryByte> carryByte;
    std::string spareText;
    detail::RecentBytes recentBytes;
};

}  // namespace Orvandeil::FileIO
