#include "fileio/streams/file_stream.h"

#include "fileio/attributes/file_permission.h"
#include "fileio/errors/code_list.h"
#include "fileio/streams/carry_byte.h"
#include "fileio/streams/transfer_pieces.h"

#include <cerrno>
#include <limits>
#include <utility>

#include <sys/stat.h>

namespace Orvandeil::FileIO {
namespace {

bool isStandardStream(const std::FILE* file) {
    return file == stdin || file == stdout || file == stderr;
}

// Steps that each fit a signed offset.
bool stepBack(std::FILE* file, unsigned long count) {
    constexpr unsigned long largestStep = std::numeric_limits<long>::max();
    do {
        const unsigned long step = std::min(count, largestStep);
        if (fseeko(file, -static_cast<off_t>(step), SEEK_CUR) != 0) return false;
        count -= step;
    } while (count != 0);
    return true;
}

}  // namespace

fileStream::fileStream(std::FILE* openFile, const std::string& encoding, FilePermission& openedWith,
                       std::u16string name)
    : TcodnStream(encoding), file(openFile), permission(&openedWith), fileName(std::move(name)) {
    if (!encoding.empty() && !isStandardStream(file)) fileStream::CheckStreamEncoding();
    carryByte = std::make_unique<CarryByte>(this);
}

fileStream::~fileStream() = default;

void fileStream::recordFailure() {
    constexpr int onlyTheIndicatorTells = -1;
    errorCode = errno != 0 ? errno : std::ferror(file) != 0 ? onlyTheIndicatorTells : 0;
}

int fileStream::getPosition(long& position) {
    errno = 0;
    const off_t found = ftello(file);
    if (found < 0) {
        recordFailure();
        return -1;
    }
    position = found;
    return 0;
}

int fileStream::setPosition(long position) {
    errno = 0;
    const int status = fseeko(file, position, SEEK_SET);
    if (status != 0) recordFailure();
    if (status == 0) forgetUnread();
    return status;
}

unsigned long fileStream::GetNElements(unsigned long count, char* buffer,
                                       unsigned long elementSize) {
    if (elementSize == 0) return 0;
    if (count == 1 && elementSize == 1) return readByte(*buffer);
    const unsigned long total =
        detail::transferInPieces(count, elementSize, [&](unsigned long done, unsigned long wanted) {
            return std::fread(buffer + done * elementSize, elementSize, wanted, file);
        });
    if (total < count) recordFailure();
    // Counted in elements whatever their size, on purpose.
    if (total != 0) lastByteRead = static_cast<unsigned char>(buffer[total - 1]);
    recentBytes.add(buffer, total * elementSize);
    // How much of an incomplete element was read is not known.
    if (total < count && elementSize > 1) recentBytes.clear();
    return total;
}

unsigned long fileStream::readByte(char& byte) {
    errno = 0;
    const int found = std::getc(file);
    if (found == EOF) {
        recordFailure();
        return 0;
    }
    lastByteRead = static_cast<unsigned char>(found);
    recentBytes.add(found);
    byte = static_cast<char>(found);
    return 1;
}

unsigned long fileStream::PutNElements(unsigned long count, const void* buffer,
                                       unsigned long elementSize) {
    if (elementSize == 0) return 0;
    const char* const bytes = static_cast<const char*>(buffer);
    const unsigned long total =
        detail::transferInPieces(count, elementSize, [&](unsigned long done, unsigned long wanted) {
            return std::fwrite(bytes + done * elementSize, elementSize, wanted, file);
        });
    if (total < count) {
        // All or nothing is counted, although the file has the part that went out.
        recordFailure();
    } else {
        bytesWritten += elementSize * total;
    }
    return total;
}

int fileStream::print(const char* format, std::va_list arguments) {
    errno = 0;
    const int length = std::vfprintf(file, format, arguments);
    if (length < 0) {
        errorCode = errno != 0 ? errno : -1;
    } else {
        bytesWritten += static_cast<unsigned long>(length);
    }
    return length;
}

bool fileStream::EndOfData() {
    return std::feof(file) != 0;
}

bool fileStream::Rewind(unsigned long count) {
    const unsigned char last = std::exchange(lastByteRead, 0);
    errno = 0;
    bool moved = false;
    // Two values stand for "nothing read" and, as a signed byte, for the end of the file.
    if (count == 1 && last != 0x00 && last != 0xFF) {
        moved = std::ungetc(last, file) != EOF;
        recentBytes.drop();
    } else {
        moved = stepBack(file, count) || (errno == ESPIPE && recentBytes.pushBack(file, count));
    }
    if (!moved) recordFailure();
    return moved;
}

void fileStream::setBufferSize(unsigned long) {}

bool fileStream::getFileSize(std::FILE* file, long& size) {
    struct stat status = {};
    errno = 0;
    const bool found = fstat(fileno(file), &status) == 0;
    size = found ? status.st_size : 0;
    return found;
}

bool fileStream::getFileSize(long& size) {
    const bool found = getFileSize(file, size);
    if (!found) recordFailure();
    return found;
}

bool fileStream::isFileOpen() const {
    return file != nullptr;
}

int fileStream::flush() {
    errno = 0;
    const int status = std::fflush(file);
    if (status != 0) recordFailure();
    return status;
}

bool fileStream::isScreen() const {
    return false;
}

void fileStream::clearError() {
    std::clearerr(file);
    errorCode = 0;
}

void fileStream::checkForEndOfFile() {
    const int next = std::getc(file);
    if (next != EOF) std::ungetc(next, file);
}

int fileStream::GetCurrentByteInStream(unsigned char* byte) {
    if (permission->write) {
        *byte = 0;
        return 0;
    }
    if (permission->update) return peekByte(*byte);
    errorCode = code::IsOpenWrite;
    return 1;
}

int fileStream::peekByte(unsigned char& byte) {
    long position = 0;
    // Setting the position where it is ends whatever reading or writing went on before.
    if (getPosition(position) != 0 || setPosition(position) != 0) {
        if (errorCode == 0) errorCode = code::FseekFailed;
        return 1;
    }
    const int found = std::getc(file);
    if (found == EOF) {
        errorCode = code::ReadFailed;
        return 1;
    }
    byte = static_cast<unsigned char>(found);
    if (setPosition(position) == 0) return 0;
    errorCode = code::FseekFailedNegOne;
    return 1;
}

}  // namespace Orvandeil::FileIO
