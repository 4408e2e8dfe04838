#include "embedded/npy/npy_file.h"

#include "embedded/npy/identifiers.h"
#include "embedded/npy/npy_header.h"
#include "fileio/host/memory.h"
#include "fileio/host/messages.h"

#include <algorithm>
#include <bit>
#include <cerrno>
#include <cstddef>
#include <cstdio>
#include <cstring>
#include <memory>
#include <utility>
#include <vector>

#include <sys/stat.h>

namespace Orvandeil::FileIO::embedded {
namespace {

// A dictionary of the supported types is far shorter; more is hostile.
constexpr std::size_t maxHeaderBytes = 1 << 20;
// What is read, or held in memory, at first when the size of the file is not known.
constexpr std::size_t firstPieceBytes = 1 << 16;
// Complex elements put together in memory before they are written.
constexpr std::size_t complexPieceElements = 4096;

struct FileCloser {
    void operator()(std::FILE* file) const noexcept { std::fclose(file); }
};
using FilePtr = std::unique_ptr<std::FILE, FileCloser>;

struct BlockDestroyer {
    void operator()(std::byte* block) const noexcept { vxMemoryFree(block); }
};
using Block = std::unique_ptr<std::byte[], BlockDestroyer>;

std::string systemText(int number) {
    return std::strerror(number);
}

class NpyInput {
public:
    explicit NpyInput(const std::string& fileName) : name(fileName) {
        file.reset(std::fopen(name.c_str(), "rb"));
        if (!file) vxErrMsgId(KESTRA::npy::cannotRead(name, systemText(errno)));
    }

    NpyHeader readHeader() {
        constexpr std::string_view magic = "\x93NUMPY";
        const std::string beginning = readText(magic.size() + 2, "header");
        if (!beginning.starts_with(magic)) fail("it does not begin as a NumPy file");
        const char major = beginning[magic.size()];
        if (major < 1 || major > 3 || beginning.back() != 0) fail("its version is unknown");
        const std::size_t length = readLength(major == 1 ? 2 : 4);
        if (length > maxHeaderBytes) fail("it is too long");
        return parseNpyHeader(readText(length, "header"), name);
    }

    // `expected` bytes of data. A header may promise more than there is, so that the block grows
    // with what really comes.
    Block readData(std::size_t expected) {
        std::size_t capacity = std::min(expected, std::max(bytesLeft(), firstPieceBytes));
        Block block = reallocated(nullptr, capacity);
        std::size_t filled = 0;
        for (;;) {
            filled += readSome(block.get() + filled, capacity - filled);
            if (filled == expected) return block;
            if (filled < capacity) endsEarly("data");
            capacity = std::min(expected, capacity * 2);
            block = reallocated(std::move(block), capacity);
        }
    }

private:
    [[noreturn]] void fail(const char* reason) const {
        vxErrMsgId(KESTRA::npy::badHeader(name, reason));
    }

    [[noreturn]] void endsEarly(const char* where) const {
        vxErrMsgId(KESTRA::npy::truncated(name, where));
    }

    static Block reallocated(Block block, std::size_t bytes) {
        auto* moved = static_cast<std::byte*>(vxMemoryReallocateOrRaise(block.get(), bytes));
        static_cast<void>(block.release());
        return Block(moved);
    }

    // Fewer than `bytes` only at the end of the file.
    std::size_t readSome(void* buffer, std::size_t bytes) {
        errno = 0;
        const std::size_t count = std::fread(buffer, 1, bytes, file.get());
        if (count < bytes && std::ferror(file.get()) != 0) {
            vxErrMsgId(KESTRA::npy::cannotRead(name, systemText(errno)));
        }
        return count;
    }

    std::string readText(std::size_t bytes, const char* where) {
        std::string text(bytes, '\0');
        if (readSome(text.data(), bytes) < bytes) endsEarly(where);
        return text;
    }

    // A little-endian number of so many bytes.
    std::size_t readLength(std::size_t bytes) {
        std::size_t length = 0;
        const std::string text = readText(bytes, "header");
        for (std::size_t i = bytes; i-- > 0;)
            length = length << 8 | static_cast<unsigned char>(text[i]);
        return length;
    }

    // 0 when the file is none that has a size.
    std::size_t bytesLeft() const {
        struct stat status = {};
        if (fstat(fileno(file.get()), &status) != 0 || !S_ISREG(status.st_mode)) return 0;
        const off_t position = ftello(file.get());
        if (position < 0 || position >= status.st_size) return 0;
        return static_cast<std::size_t>(status.st_size - position);
    }

    const std::string& name;
    FilePtr file;
};

void swapBytes(std::byte* units, std::size_t count, std::size_t size) {
    for (std::byte* unit = units; unit != units + count * size; unit += size)
        std::reverse(unit, unit + size);
}

// One dimension of a file's elements, and the distance in the array of two neighbours along it.
struct Axis {
    std::size_t length;
    std::size_t stride;
};

// The axes of a file's elements, the fastest first. Arrays are in Fortran order themselves.
std::vector<Axis> fileAxes(const NpyHeader& header) {
    if (header.isFortranOrder) return {{npyElementCount(header.shape), 1}};
    std::vector<Axis> axes;
    std::size_t stride = 1;
    for (const std::size_t length : header.shape) {
        if (length != 1) axes.push_back({length, stride});
        stride *= length;
    }
    std::reverse(axes.begin(), axes.end());
    return axes;
}

// Puts `count` values of `size` bytes, `step` bytes apart in the file, at their places in the
// array.
template <std::size_t size>
void place(const std::byte* from, std::size_t step, std::byte* to, std::size_t count,
           const std::vector<Axis>& axes) {
    std::vector<std::size_t> index(axes.size(), 0);
    std::size_t offset = 0;
    for (; count > 0; --count, from += step) {
        std::memcpy(to + offset * size, from, size);
        for (std::size_t i = 0; i < axes.size(); ++i) {
            offset += axes[i].stride;
            if (++index[i] < axes[i].length) break;
            offset -= axes[i].stride * axes[i].length;
            index[i] = 0;
        }
    }
}

auto placeOfSize(std::size_t size) {
    switch (size) {
        case 1:
            return place<1>;
        case 2:
            return place<2>;
        case 4:
            return place<4>;
        default:
            return place<8>;
    }
}

// Whether the bytes in the file are those of the array.
bool liesAsInArray(const NpyHeader& header) {
    return header.type->complexity == vxREAL && fileAxes(header).size() <= 1;
}

ArrayPtr placed(const NpyHeader& header, const std::byte* data) {
    const NpyType& type = *header.type;
    ArrayPtr array = makeNumeric(type.classID, header.shape, type.complexity);
    const std::size_t count = npyElementCount(header.shape);
    if (count == 0) return array;
    const std::size_t size = elementBytes(type.classID);
    const std::size_t step = npyElementBytes(type);
    const auto placeAll = placeOfSize(size);
    placeAll(data, step, static_cast<std::byte*>(realData(*array)), count, fileAxes(header));
    if (type.complexity == vxCOMPLEX) {
        auto* imaginary = static_cast<std::byte*>(imaginaryData(*array));
        placeAll(data + size, step, imaginary, count, fileAxes(header));
    }
    return array;
}

ArrayPtr arrayOf(const NpyHeader& header, Block data) {
    ArrayPtr array;
    if (liesAsInArray(header)) {
        array = makeNumeric(header.type->classID, header.shape, data.get());
        static_cast<void>(data.release());
    } else {
        array = placed(header, data.get());
    }
    if (header.type->classID == vxLOGICAL_CLASS) {
        auto* const values = static_cast<std::byte*>(realData(*array));
        std::transform(values, values + elementCount(*array), values,
                       [](std::byte value) { return std::byte{value != std::byte{0}}; });
    }
    return array;
}

class NpyOutput {
public:
    explicit NpyOutput(const std::string& fileName) : name(fileName) {
        file.reset(std::fopen(name.c_str(), "wb"));
        if (!file) fail();
    }

    void write(const void* data, std::size_t bytes) {
        if (bytes > 0 && std::fwrite(data, 1, bytes, file.get()) != bytes) fail();
    }

    // Real and imaginary parts in turn.
    void writeComplex(const std::byte* real, const std::byte* imaginary, std::size_t count,
                      std::size_t size) {
        std::vector<std::byte> piece(std::min(count, complexPieceElements) * size * 2);
        while (count > 0) {
            const std::size_t now = std::min(count, complexPieceElements);
            for (std::size_t i = 0; i < now; ++i) {
                std::memcpy(&piece[2 * i * size], real + i * size, size);
                std::memcpy(&piece[(2 * i + 1) * size], imaginary + i * size, size);
            }
            write(piece.data(), now * size * 2);
            real += now * size;
            imaginary += now * size;
            count -= now;
        }
    }

    // Reports what only closing tells, a full device for instance.
    void close() {
        if (std::fclose(file.release()) != 0) fail();
    }

private:
    [[noreturn]] void fail() const {
        vxErrMsgId(KESTRA::npy::cannotWrite(name, systemText(errno)));
    }

    const std::string& name;
    FilePtr file;
};

NpyHeader headerFor(const std::string& file, const vxArray& array) {
    const vxComplexity complexity = vxArrayIsComplex(&array) ? vxCOMPLEX : vxREAL;
    const std::size_t count = vxArrayDimensionCount(&array);
    const NpyType* type = findNpyType(vxArrayClassID(&array), complexity);
    if (type == nullptr || count > maxNpyDimensions) {
        vxErrMsgId(KESTRA::npy::unsupportedClass(file, vxArrayClassName(&array)));
    }
    const std::size_t* lengths = vxArrayDimensions(&array);
    return {type, false, true, Dimensions(lengths, lengths + count)};
}

}  // namespace

ArrayPtr npyRead(const std::string& file) {
    NpyInput input(file);
    const NpyHeader header = input.readHeader();
    const std::size_t bytes = npyElementCount(header.shape) * npyElementBytes(*header.type);
    Block data = input.readData(bytes);
    const bool isNative = header.isBigEndian == (std::endian::native == std::endian::big);
    const std::size_t size = elementBytes(header.type->classID);
    if (!isNative) swapBytes(data.get(), bytes / size, size);
    return arrayOf(header, std::move(data));
}

void npyWrite(const std::string& file, const vxArray& array) {
    static_assert(std::endian::native == std::endian::little, "data go out as they are");
    const NpyHeader header = headerFor(file, array);
    NpyOutput output(file);
    const std::string beginning = formatNpyHeader(header);
    output.write(beginning.data(), beginning.size());
    const auto* real = static_cast<const std::byte*>(vxArrayData(&array));
    const std::size_t size = elementBytes(header.type->classID);
    const std::size_t count = elementCount(array);
    if (header.type->complexity == vxCOMPLEX) {
        const auto* imaginary = static_cast<const std::byte*>(imaginaryData(array));
        output.writeComplex(real, imaginary, count, size);
    } else {
        output.write(real, count * size);
    }
    output.close();
}

}  // namespace Orvandeil::FileIO::embedded
