#include "embedded/builtins/binary_write.h"

#include "embedded/builtins/bit_transfer.h"
#include "embedded/builtins/file_element.h"
#include "embedded/builtins/open_close.h"
#include "embedded/services/array.h"
#include "fileio/buffers/element_conversion.h"
#include "fileio/buffers/output_buffer.h"
#include "fileio/constants.h"
#include "fileio/errors/code_list.h"

#include <algorithm>

namespace Orvandeil::FileIO::embedded {
namespace {

// One write: blocks of elements with a skip between them, all in one block when nothing is skipped.
class Writer {
public:
    Writer(OpenFile& target, const FileElement& fileElement, const WriteAttributes& attributes,
           const vxArray& value)
        : file(target),
          element(fileElement),
          skip(attributes.skip.skip),
          wanted(elementCount(value)),
          perBlock(skip == 0 ? wanted : attributes.precision.repeatCount),
          sourceClass(vxArrayClassID(&value)),
          source(static_cast<const char*>(vxArrayData(&value))),
          sourceBytes(elementBytes(sourceClass)),
          scratch(element.classID, 1, 1, 1) {}

    WriteResult run() {
        WriteResult result;
        const unsigned long bytesBefore = file.stream->getBytesWritten();
        while (result.count < wanted) {
            const unsigned long count = std::min(perBlock, wanted - result.count);
            const unsigned long put = putBlock(result.count, count);
            result.count += put;
            if (put < count) {
                result.failure = file.failure(file.stream->getErrorCode());
                break;
            }
            if (result.count < wanted && (result.failure = skipForward())) break;
        }
        // The stream counts a write that came up short as nothing; whole elements of it count here.
        result.bytes = element.form == FileElement::Plain
                           ? result.count * element.bytes
                           : file.stream->getBytesWritten() - bytesBefore;
        return result;
    }

private:
    // Values of the file's own class and byte order go out from where they lie.
    bool isNative() const { return sourceClass == element.classID && !element.needsFlip; }

    unsigned long putBlock(unsigned long first, unsigned long count) {
        const unsigned long atOnce =
            isNative() && element.form == FileElement::Plain
                ? count
                : std::max(1UL, constants::conversionPieceBytes / scratch.GetTypeSize());
        unsigned long done = 0;
        unsigned long piece = 0;
        unsigned long put = 0;
        while (done < count && put == piece) {
            piece = std::min(count - done, atOnce);
            put = putConverted(source + (first + done) * sourceBytes, piece);
            done += put;
        }
        return done;
    }

    unsigned long putConverted(const char* values, unsigned long count) {
        if (isNative()) return put(values, count);
        scratch.SetRollbackPoint();
        const void* const converted = scratch.AppendData(sourceClass, values, count);
        if (element.needsFlip) scratch.FlipBytes();
        const unsigned long done = put(converted, count);
        scratch.Rollback();
        return done;
    }

    unsigned long put(const void* values, unsigned long count) {
        switch (element.form) {
            case FileElement::Plain:
                return file.stream->PutNElements(count, values, element.bytes);
            case FileElement::Field:
                return writeFields(file, element.field, count, element.classID, values);
            case FileElement::Text:
                return putText(static_cast<const char16_t*>(values), count);
        }
        __builtin_unreachable();
    }

    // What PutString returns depends on the encoding; a failure shows in the file.
    unsigned long putText(const char16_t* units, unsigned long count) {
        const unsigned long before = file.stream->getBytesWritten();
        file.stream->PutString(units, count);
        const bool wentOut = file.stream->getBytesWritten() != before;
        return wentOut || std::ferror(file.handle.get()) == 0 ? count : 0;
    }

    std::optional<Failure> skipForward() {
        if (element.form == FileElement::Field && !alignFields(file)) return carryFailure(file);
        if (fseeko(file.handle.get(), skip, SEEK_CUR) == 0) return std::nullopt;
        return file.failure(code::FseekFailedSkip);
    }

    OpenFile& file;
    const FileElement& element;
    long skip;
    unsigned long wanted;
    unsigned long perBlock;
    vxClassID sourceClass;
    const char* source;
    std::size_t sourceBytes;
    OutputBuffer scratch;
};

}  // namespace

WriteResult writeBinary(OpenFile& file, const vxArray& value, const WriteAttributes& attributes) {
    requireWritable(file);
    const PrecisionString& precision = attributes.precision;
    const FileElement element = elementInFile(precision, precision.outputType);
    beginElements(file, Direction::Writing, element, precision.machineFormat);
    WriteResult result = Writer(file, element, attributes, value).run();
    if (result.failure || !file.permission.autoFlush) return result;
    result.failure = flushBuffers(file);
    return result;
}

}  // namespace Orvandeil::FileIO::embedded
