#include "embedded/builtins/scan.h"

#include "embedded/services/memory.h"
#include "fileio/buffers/output_buffer.h"
#include "fileio/errors/code_list.h"
#include "fileio/scanf/scan_control.h"
#include "fileio/text/input_string_stream.h"
#include "fileio/text/output_string_stream.h"

#include <algorithm>
#include <array>
#include <cstring>
#include <iterator>
#include <memory>
#include <string_view>

namespace Orvandeil::FileIO::embedded {
namespace {

constexpr std::size_t usualChunk = 4;
constexpr std::size_t largestChunk = 8388608;

void padWithZeros(OutputBuffer& values, std::size_t missing) {
    if (missing == 0) return;
    void* const padding = values.Allocate(missing);
    std::memset(padding, 0, missing * values.GetTypeSize());
}

struct Shape {
    std::size_t rows;
    std::size_t columns;
};

// Pads the last column. Unlike a binary read, a scan never drops rows that were asked for.
Shape padTo(std::size_t rows, OutputBuffer& values) {
    const std::size_t count = values.GetSize();
    const std::size_t columns = (count - 1) / rows + 1;
    std::size_t wanted = 0;
    if (__builtin_mul_overflow(rows, columns, &wanted)) vxMemoryRaiseExhausted();
    padWithZeros(values, wanted - count);
    return {rows, columns};
}

// Without memory for a matrix the values are delivered as a vector.
void deliver(OutputBuffer& values, const SizeAttribute& size, ScanResult& result) {
    const std::size_t count = values.GetSize();
    const bool isRow = values.GetClassID() == vxCHAR_CLASS;
    Shape shape = isRow ? Shape{1, count} : Shape{count, 1};
    try {
        if (size.isMatrix && count != 0) shape = padTo(size.m, values);
    } catch (const OutOfMemoryError&) {
        result.code = code::NoMemory;
    }
    result.array.reset(values.TransferArray());
    if (count == 0) return;
    vxArraySetRows(result.array.get(), shape.rows);
    vxArraySetColumns(result.array.get(), shape.columns);
}

ScanResult scanStream(TcodnStream& stream, const std::u16string& format,
                      const SizeAttribute& size) {
    finFormatParser parser(format.c_str(), &stream);
    parser.InitFormatPieces();
    OutputBuffer values(parser.getResultClass(), usualChunk, usualChunk, largestChunk);
    ScanResult result;
    const unsigned long limit = size.isInfinite ? 0 : size.m * size.n;
    scanControl control(limit, size.isInfinite, result.count, stream, parser, values);
    try {
        control.performMainScan();
        result.code = control.getError();
    } catch (const OutOfMemoryError&) {
        // One field too long for the memory leaves the values before it.
        result.code = code::NoMemory;
    }
    deliver(values, size, result);
    return result;
}

bool isQuietEnd(int status, bool hasFileError) {
    const bool isNearMiss = status == code::NoHelp && !hasFileError;
    return status == 0 || status == code::MatchingFailure || isNearMiss;
}

// Asked without the stream, which would record that a pipe has no position.
std::optional<long> positionIn(const OpenFile& file) {
    const off_t position = ftello(file.handle.get());
    return position < 0 ? std::nullopt : std::optional<long>(position);
}

// Where a decoder expects a byte order mark, text without one is big-endian to it. A mark would
// stand in front of the first number.
std::string encodingWithoutMark(const std::string& name) {
    outputStringStream named(name.empty() ? "UTF-8" : name);
    constexpr std::array<std::string_view, 2> marked = {"UTF-16", "UTF-32"};
    UErrorCode status = U_ZERO_ERROR;
    const std::string icuName = ucnv_getName(named.GetConv(0), &status);
    return std::ranges::find(marked, icuName) == marked.end() ? icuName : icuName + "BE";
}

#ifdef FILEIO_FAST_PATHS
struct FreeBytes {
    void operator()(char* bytes) const noexcept { vxMemoryFree(bytes); }
};
using HostBytes = std::unique_ptr<char, FreeBytes>;

// The bytes of a text of ASCII characters, as most are, in the usual encoding, and a NUL; null for
// any other text. By blocks that stay in the cache.
HostBytes asciiBytes(std::u16string_view text, const std::string& encoding) {
    if (!encoding.empty() && encoding != "UTF-8") return nullptr;
    HostBytes bytes(static_cast<char*>(vxMemoryAllocateOrRaise(text.size() + 1)));
    char* end = bytes.get();
    for (std::u16string_view block; !text.empty(); text.remove_prefix(block.size())) {
        constexpr std::size_t blockUnits = 4096;
        block = text.substr(0, blockUnits);
        char16_t used = 0;
        for (const char16_t unit : block)
            used |= unit;
        if (used >= 0x80) return nullptr;
        end = std::transform(block.begin(), block.end(), end,
                             [](char16_t unit) { return static_cast<char>(unit); });
    }
    *end = 0;
    return bytes;
}
#endif

// Complete with what a stateful encoding ends a text with, which a stream leaves pending.
std::string encoded(const std::u16string& text, const std::string& encoding) {
    outputStringStream encoder(encodingWithoutMark(encoding));
    std::string bytes;
    const char16_t* next = text.data();
    UErrorCode status;
    do {
        status = U_ZERO_ERROR;
        char piece[4096];
        char* target = piece;
        ucnv_fromUnicode(encoder.GetConv(0), &target, std::end(piece), &next,
                         text.data() + text.size(), nullptr, true, &status);
        bytes.append(piece, target);
    } while (status == U_BUFFER_OVERFLOW_ERROR);
    return bytes;
}

// Positions of the result are UTF-16 units.
ScanResult scanBytes(const char* bytes, std::size_t count, const std::string& encoding,
                     const std::u16string& format, const SizeAttribute& size) {
    inputStringStream stream(bytes, static_cast<long>(count), encoding);
    ScanResult result = scanStream(stream, format, size);
    if (!isQuietEnd(result.code, false)) result.failure = Failure{result.code, "text"};
    result.position = static_cast<long>(stream.getUTF16Position());
    return result;
}

}  // namespace

ScanResult scan(OpenFile& file, const std::u16string& format, const SizeAttribute& size) {
    // A stream that cannot be read from would deliver zeros for ever.
    requireReadable(file);
    beginTransfer(file, Direction::Reading);
    const bool hadFileError = std::ferror(file.handle.get()) != 0;
    ScanResult result = scanStream(*file.stream, format, size);
    const bool hasFileError = std::ferror(file.handle.get()) != 0;
    // To literals and scansets any read that brings nothing is the end of the data.
    const bool isEnd = result.code == 0 || result.code == code::MatchingFailure;
    const bool isHiddenError = hasFileError && !hadFileError && isEnd;
    if (isHiddenError) result.code = file.stream->getErrorCode();
    if (!isQuietEnd(result.code, hasFileError)) result.failure = file.failure(result.code);
    result.position = positionIn(file);
    return result;
}

ScanResult scanText(const std::u16string& text, const std::string& encoding,
                    const std::u16string& format, const SizeAttribute& size) {
#ifdef FILEIO_FAST_PATHS
    if (const HostBytes bytes = asciiBytes(text, encoding))
        return scanBytes(bytes.get(), text.size(), encoding, format, size);
#endif
    const std::string bytes = encoded(text, encoding);
    return scanBytes(bytes.c_str(), bytes.size(), encoding, format, size);
}

}  // namespace Orvandeil::FileIO::embedded
