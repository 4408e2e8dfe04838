#include "embedded/builtins/piecewise_read.h"

#include "embedded/builtins/bit_transfer.h"
#include "embedded/builtins/pick_blocks.h"
#include "fileio/buffers/byte_order.h"
#include "fileio/buffers/element_conversion.h"
#include "fileio/constants.h"

#include <algorithm>
#include <vector>

namespace Orvandeil::FileIO::embedded {
namespace {

// Reading on costs less than positioning up to about here.
constexpr unsigned long longestSkipRead = 16384;

// The bytes from the position to the end, as far as the file can tell its size; else 0.
unsigned long bytesLeft(std::FILE* file) {
    long size = 0;
    const off_t position = ftello(file);
    if (position < 0 || !fileStream::getFileSize(file, size) || size <= position) return 0;
    return static_cast<unsigned long>(size - position);
}

unsigned long perPiece(unsigned long bytes) {
    return std::max(1UL, constants::conversionPieceBytes / bytes);
}

// The sources of elements. `there` of them surely lie before the end, `atOnce` make a piece, and
// behind the last of `there` the plain way may find up to `tail` more.

class Neighbours {
public:
    Neighbours(OpenFile& source, const WantedElements& wanted)
        : there(std::min(wanted.count, bytesLeft(source.handle.get()) / wanted.element.bytes)),
          atOnce(perPiece(wanted.element.bytes)),
          stream(*source.stream),
          elementBytes(wanted.element.bytes) {}

    unsigned long read(unsigned long count, char* to) {
        return stream.GetNElements(count, to, elementBytes);
    }

    unsigned long there;
    unsigned long atOnce;
    unsigned long tail = 0;

private:
    fileStream& stream;
    unsigned long elementBytes;
};

class Fields {
public:
    Fields(OpenFile& source, const WantedElements& wanted)
        : there(fieldsLeft(source, wanted)),
          atOnce(perPiece(wanted.element.bytes)),
          reader(source, wanted.element.field, std::min(there, atOnce)),
          classID(wanted.element.classID) {}

    unsigned long read(unsigned long count, char* to) {
        const unsigned long got = reader.fetch(count);
        reader.unpack(classID, to);
        return got;
    }

    unsigned long there;
    unsigned long atOnce;
    unsigned long tail = 0;

private:
    static unsigned long fieldsLeft(OpenFile& source, const WantedElements& wanted) {
        const auto pending = static_cast<unsigned long>(source.carry().pendingBits);
        const unsigned long bits = 8 * bytesLeft(source.handle.get()) + pending;
        return std::min(wanted.count,
                        bits / static_cast<unsigned long>(wanted.element.field.stride));
    }

    FieldReader reader;
    vxClassID classID;
};

// Blocks with a skip between them: a positioning for every block is what makes strided reads slow.
class Strided {
public:
    Strided(OpenFile& source, const WantedElements& wanted)
        : perBlock(wanted.perBlock),
          blockBytes(wanted.perBlock * wanted.element.bytes),
          strideBytes(blockBytes + wanted.skip),
          stream(*source.stream) {
        if (wanted.count == 0 || wanted.skip > longestSkipRead ||
            blockBytes > constants::transferPieceBytes) {
            return;
        }
        const unsigned long whole = bytesLeft(source.handle.get()) / strideBytes;
        const unsigned long blocks =
            std::min((wanted.count - 1) / perBlock, whole == 0 ? 0 : whole - 1);
        there = blocks * perBlock;
        atOnce = perPiece(strideBytes) * perBlock;
        tail = std::min(wanted.count - there, 2 * perBlock);
        span.resize(std::min(there, atOnce) / perBlock * strideBytes);
    }

    unsigned long read(unsigned long count, char* to) {
        const unsigned long bytes = count / perBlock * strideBytes;
        const unsigned long got = stream.GetNElements(bytes, span.data(), 1);
        const unsigned long whole = got / strideBytes;
        pickBlocks(span.data(), {blockBytes, strideBytes}, whole, to);
        // A file that has become shorter meanwhile: the plain way goes on behind the last whole
        // block.
        long position = 0;
        if (got < bytes && stream.getPosition(position) == 0) {
            stream.setPosition(position - static_cast<long>(got % strideBytes));
        }
        return whole * perBlock;
    }

    unsigned long there = 0;
    unsigned long atOnce = 0;
    unsigned long tail = 0;

private:
    unsigned long perBlock;
    unsigned long blockBytes;
    unsigned long strideBytes;
    fileStream& stream;
    std::vector<char> span;
};

template <class Source>
unsigned long readPieces(Source source, const WantedElements& wanted, OutputBuffer& target) {
    if (source.there == 0) return 0;
    const bool isConverted = wanted.collected != target.GetClassID();
    const std::size_t rawBytes = wanted.element.bytes;
    std::vector<char> raw(isConverted ? std::min(source.there, source.atOnce) * rawBytes : 0);
    std::size_t room = source.there + source.tail;
    auto* to = static_cast<char*>(target.Allocate(room));
    unsigned long done = 0;
    unsigned long count = 0;
    unsigned long got = 0;
    while (done < source.there && got == count) {
        count = std::min(source.there - done, source.atOnce);
        char* const piece = isConverted ? raw.data() : to;
        got = source.read(count, piece);
        if (wanted.element.needsFlip) detail::flipElements(piece, rawBytes, got);
        if (isConverted) {
            AssignToVoidBuffer(target.GetClassID(), to, wanted.collected, piece, got);
        }
        to += got * target.GetTypeSize();
        done += got;
    }
    target.SetLastChunkSize(done);
    return done;
}

}  // namespace

unsigned long readInPieces(OpenFile& file, const WantedElements& wanted, OutputBuffer& target) {
    const FileElement& element = wanted.element;
    if (element.form == FileElement::Plain && wanted.skip != 0) {
        return readPieces(Strided(file, wanted), wanted, target);
    }
    if (wanted.skip != 0 || element.form == FileElement::Text) return 0;
    if (element.form == FileElement::Field) {
        return readPieces(Fields(file, wanted), wanted, target);
    }
    // Elements that stay as they are go straight into their block in the plain way as well.
    if (wanted.collected == target.GetClassID() && !element.needsFlip) return 0;
    return readPieces(Neighbours(file, wanted), wanted, target);
}

}  // namespace Orvandeil::FileIO::embedded
