#include "embedded/builtins/binary_read.h"

#include "embedded/builtins/bit_transfer.h"
#include "embedded/builtins/file_element.h"
#include "embedded/builtins/piecewise_read.h"
#include "fileio/buffers/element_conversion.h"
#include "fileio/buffers/output_buffer.h"
#include "fileio/constants.h"
#include "fileio/errors/code_list.h"

#include <algorithm>
#include <cerrno>
#include <limits>
#include <vector>

namespace Orvandeil::FileIO::embedded {
namespace {

constexpr unsigned long everything = std::numeric_limits<unsigned long>::max();
constexpr std::size_t usualChunk = 4096;
constexpr std::size_t largestChunk = 1 << 26;

// The class that the caller gets.
vxClassID deliveredClass(const PrecisionString& precision) {
    const bool isOwn = precision.outputType == dataType::NoConversion;
    return fiPkGetClassIDFromType(
        static_cast<std::size_t>(isOwn ? precision.inputType : precision.outputType));
}

// The class that the elements are collected in. The bytes of logical values may be any; what turns
// them into 0 and 1 is the conversion, so there has to be one.
vxClassID collectedClass(const FileElement& element, vxClassID delivered) {
    const bool isCopied = element.classID == vxLOGICAL_CLASS && delivered == vxLOGICAL_CLASS;
    return isCopied ? vxUINT8_CLASS : element.classID;
}

// Reads bytes that cannot be passed over otherwise. False when reading fails, unlike at the end.
bool readPast(fileStream& stream, unsigned long bytes) {
    std::vector<char> piece(std::min(bytes, constants::transferPieceBytes));
    unsigned long wanted = 0;
    unsigned long got = 0;
    while (bytes != 0 && got == wanted) {
        wanted = std::min(bytes, piece.size());
        got = stream.GetNElements(wanted, piece.data(), 1);
        bytes -= got;
    }
    return got == wanted || stream.getErrorCode() == 0;
}

// One read: blocks of elements with a skip between them, all in one block when nothing is skipped.
// Elements are collected as they are in the file; those of the fast part are converted already.
class Reader {
public:
    Reader(OpenFile& source, const FileElement& fileElement, const ReadAttributes& attributes,
           unsigned long count, OutputBuffer& converted, OutputBuffer& collected)
        : file(source),
          element(fileElement),
          skip(attributes.skip.skip),
          perBlock(skip == 0 ? count : attributes.precision.repeatCount),
          wanted(count),
          target(converted),
          buffer(collected) {}

    std::optional<Failure> run() {
        unsigned long total = readFastPart();
        while (total < wanted) {
            const unsigned long count = std::min(perBlock, wanted - total);
            const unsigned long got = readBlock(count);
            total += got;
            if (got < count) return shortRead();
            if (total < wanted && !skipForward()) return file.failure(code::FseekFailedSkip);
        }
        return std::nullopt;
    }

private:
    unsigned long readFastPart() {
#ifdef FILEIO_FAST_PATHS
        const auto skipped = static_cast<unsigned long>(skip);
        return readInPieces(file, {element, wanted, perBlock, skipped, buffer.GetClassID()},
                            target);
#else
        return 0;
#endif
    }

    unsigned long readBlock(unsigned long count) {
        switch (element.form) {
            case FileElement::Plain:
                return file.stream->GetNElements(count, buffer, element.bytes);
            case FileElement::Field:
                return readFields(file, element.field, count, buffer);
            case FileElement::Text:
                return file.stream->GetNCodePoints(buffer, count, nullptr);
        }
        __builtin_unreachable();
    }

    bool skipForward() {
        if (element.form == FileElement::Field) alignFields(file);
        errno = 0;
        if (fseeko(file.handle.get(), skip, SEEK_CUR) == 0) return true;
        if (errno != ESPIPE) return false;
        return readPast(*file.stream, static_cast<unsigned long>(skip));
    }

    std::optional<Failure> shortRead() const {
        const int code = file.stream->getErrorCode();
        return code == 0 ? std::nullopt : std::optional(file.failure(code));
    }

    OpenFile& file;
    const FileElement& element;
    long skip;
    unsigned long perBlock;
    unsigned long wanted;
    [[maybe_unused]] OutputBuffer& target;
    OutputBuffer& buffer;
};

unsigned long countOf(const SizeAttribute& size) {
    unsigned long count = 0;
    const bool tooMany = __builtin_mul_overflow(size.m, size.n, &count);
    return size.isInfinite || tooMany ? everything : count;
}

ArrayPtr deliver(OutputBuffer& converted, OutputBuffer& collected, const SizeAttribute& size) {
    const bool isSame = collected.GetClassID() == converted.GetClassID();
    if (isSame && converted.GetSize() == 0) return ArrayPtr(collected.TransferArray(size, false));
    converted.AppendBuffer(collected);
    return ArrayPtr(converted.TransferArray(size, false));
}

}  // namespace

ReadResult readBinary(OpenFile& file, const ReadAttributes& attributes) {
    requireReadable(file);
    const PrecisionString& precision = attributes.precision;
    const FileElement element = elementInFile(precision, precision.inputType);
    SizeAttribute size = attributes.size;
    size.Adjust(precision.outputType, element.bytes);
    beginElements(file, Direction::Reading, element, precision.machineFormat);

    const vxClassID delivered = deliveredClass(precision);
    OutputBuffer converted(delivered, 1, 1, 1);
    OutputBuffer collected(collectedClass(element, delivered), usualChunk, 1, largestChunk);
    ReadResult result;
    result.failure = Reader(file, element, attributes, countOf(size), converted, collected).run();
    result.count = converted.GetSize() + collected.GetSize();
    if (element.needsFlip) collected.FlipBytes();
    result.array = deliver(converted, collected, size);
    return result;
}

}  // namespace Orvandeil::FileIO::embedded
