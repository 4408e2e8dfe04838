#include "fileio/buffers/host_block.h"
#include "fileio/errors/identifiers.h"
#include "fileio/host/console.h"
#include "fileio/host/files.h"
#include "fileio/host/messages.h"
#include "fileio/host/text.h"
#include "fileio/streams/file_stream.h"
#include "fileio/streams/transfer_pieces.h"

#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <memory>

namespace Orvandeil::FileIO {
namespace {

constexpr const char* answerWithoutDetection = "UTF-8";
constexpr long noLimit = -1;
constexpr unsigned long mostBytesExamined = 0x7FFFFFFF;  // detectors count in 32 bits

struct FileCloser {
    void operator()(std::FILE* file) const noexcept { std::fclose(file); }
};

std::string reportFailure(const char* operation, const std::u16string& fileName) {
    const int cause = errno;
    char scratch[128];
    // The GNU form: the text is in the scratch or permanent, and never missing.
    const std::string message = std::string("fileStream::DetectCharset():") + operation +
                                " failed: error : " + strerror_r(cause, scratch, sizeof scratch) +
                                " for " + vxFileNameToBytes(fileName) + '\n';
    vxConsolePrintMessage(message.data(), message.size());
    return answerWithoutDetection;
}

// Reads up to `count` bytes from `start` on. False on failure.
bool readFrom(std::FILE* file, long start, char* bytes, unsigned long& count) {
    errno = 0;
    if (fseeko(file, start, SEEK_SET) != 0) return false;
    count = detail::transferInPieces(count, 1, [&](unsigned long done, unsigned long wanted) {
        return std::fread(bytes + done, 1, wanted, file);
    });
    return std::ferror(file) == 0;
}

}  // namespace

std::string fileStream::DetectCharset(unsigned long startOffset) const {
    const long limit = DetectedCharSet();
    long size = 0;
    getFileSize(file, size);
    if (size == 0 || (limit != noLimit && size >= limit)) return answerWithoutDetection;
    if (startOffset >= static_cast<unsigned long>(size)) return answerWithoutDetection;

    const std::unique_ptr<std::FILE, FileCloser> again(vxFileOpen(fileName, "rb"));
    if (!again) return reportFailure("fopen", fileName);
    const auto start = static_cast<long>(startOffset);
    auto count = std::min(static_cast<unsigned long>(size - start), mostBytesExamined);
    const detail::HostBytes bytes(static_cast<char*>(vxMemoryAllocate(count)));
    if (!bytes) errno = ENOMEM;
    if (!bytes || !readFrom(again.get(), start, bytes.get(), count)) {
        return errno != 0 ? reportFailure("fread", fileName) : answerWithoutDetection;
    }
    return vxTextDetectCharset(bytes.get(), count, *vxConsoleOutput(), fileName);
}

long fileStream::DetectedCharSet() const {
    static const long limit = [] {
        const char* const text = std::getenv("QZ_FOPEN_CHARSET_DETECT_LIMIT");
        return text ? std::strtol(text, nullptr, 10) : noLimit;
    }();
    return limit;
}

void fileStream::CheckStreamEncoding() {
    const std::string name = GetEncodingName();
    if (vxTextEncodingIsSupported(vxTextCanonicalEncodingName(name.c_str()).c_str())) return;
    // Accepted in silence on purpose.
    if (name == "macintosh") return;
    vxWarningMsgId(KESTRA::iofun::UnsupportedEncoding(name));
}

}  // namespace Orvandeil::FileIO
