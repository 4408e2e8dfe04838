#include "embedded/builtins/bit_fields.h"

#include "embedded/builtins/binary_read.h"
#include "embedded/builtins/binary_write.h"
#include "embedded/builtins/open_close.h"
#include "embedded/builtins/positioning.h"
#include "tests/properties/properties.h"
#include "tests/support/arrays.h"
#include "tests/support/test_files.h"

#include <algorithm>
#include <vector>

namespace properties {
namespace {

using namespace Orvandeil::FileIO;
using namespace Orvandeil::FileIO::embedded;

// A file as single bits. In big-endian order, bytes and elements begin with their highest bit, else
// with their lowest.
struct BitFile {
    std::uint64_t transfer(bool isWrite, std::uint64_t element, int count) {
        std::uint64_t value = 0;
        for (int i = 0; i < count; ++i, ++bit) {
            const int shift = bigEndian ? count - 1 - i : i;
            const std::size_t place = bigEndian ? bit ^ 7 : bit;
            if (isWrite) bits[place] = element >> shift & 1;
            value |= std::uint64_t{bits[place]} << shift;
        }
        return value;
    }
    void align() { bit = (bit + 7) / 8 * 8; }
    std::string bytes() const {
        std::string run(bits.size() / 8, '\0');
        for (std::size_t i = 0; i < bits.size(); ++i)
            run[i / 8] = static_cast<char>(run[i / 8] | bits[i] << i % 8);
        return run;
    }

    std::vector<bool> bits;
    std::size_t bit = 0;
    bool bigEndian = false;
};

struct Elements {
    std::string type;
    int bits, stride;
    std::size_t block, skip;  // elements, bytes
};

// What the model transfers; `values` is cut to what there was to read.
void transferByModel(BitFile& model, bool isWrite, const Elements& elements,
                     std::vector<std::uint64_t>& values) {
    const auto stride = static_cast<std::size_t>(elements.stride);
    for (std::size_t i = 0; i < values.size(); ++i) {
        if (i != 0 && i % elements.block == 0 && elements.skip != 0) {
            model.align();
            model.bit += 8 * elements.skip;
        }
        if (!isWrite && model.bit + stride > model.bits.size()) {
            model.bit = std::max(model.bit, model.bits.size());
            return values.resize(i);
        }
        values[i] = model.transfer(isWrite, values[i], elements.bits);
        if (elements.type[0] == 'b')
            values[i] = static_cast<std::uint64_t>(signExtended(values[i], elements.bits));
        model.transfer(isWrite, 0, elements.stride - elements.bits);
    }
}

// The same transfer by file and by model; what shows of the former.
std::string transfer(OpenFile& file, BitFile& model, bool isWrite, const Elements& elements,
                     std::vector<std::uint64_t> values) {
    const MachineFormat format(model.bigEndian ? "big-endian" : "little-endian");
    const vxClassID classID = elements.type[0] == 'b' ? vxINT64_CLASS : vxUINT64_CLASS;
    std::string precision = std::to_string(elements.block) + '*' + elements.type;
    const ArrayPtr skip = makeScalar(static_cast<double>(elements.skip));
    const ArrayPtr count = makeScalar(static_cast<double>(values.size()));
    transferByModel(model, isWrite, elements, values);
    const std::string wanted = support::listed(classID, values.data(), values.size());
    const std::string where = (isWrite ? "writing " : "reading ") + precision;
    if (!isWrite) {
        precision += std::string("=>") + nameOfClass(classID);
        const auto result =
            readBinary(file, ReadAttributes(precision, format, count.get(), skip.get()));
        const void* const data = vxArrayData(result.array.get());
        requireEqual(support::listed(classID, data, result.count), wanted, where);
        requireEqual(std::to_string(result.failure.has_value()), "0", where);
        return wanted;
    }
    const ArrayPtr array = makeNumeric(classID, {values.size()});
    std::ranges::copy(values, static_cast<std::uint64_t*>(realData(*array)));
    const auto result =
        writeBinary(file, *array, WriteAttributes(*array, precision, format, skip.get()));
    requireEqual(std::to_string(result.count), std::to_string(values.size()), where);
    return wanted;
}

// Elements of any width, sign, stride, block and skip; whole bytes are plain ones as well.
Elements anyElements(Bytes& input, bool arePlain) {
    const auto below = [&](int bound) {
        return static_cast<int>(input.below(static_cast<std::size_t>(bound)));
    };
    const int bits = arePlain ? 8 << below(4) : 1 + below(64);
    const int stride = arePlain ? bits : bits + below(65 - bits);
    const std::string width = std::to_string(bits);
    std::string field = below(2) == 0 ? "bit" : "ubit";
    field += width + "in" + std::to_string(stride);
    const std::size_t block = 1 + input.below(5);
    const std::size_t skip = input.below(4) == 0 ? input.below(20) : 0;
    return {arePlain ? "uint" + width : field, bits, stride, block, skip};
}

std::vector<std::uint64_t> anyValues(Bytes& input) {
    std::vector<std::uint64_t> values(input.below(input.below(16) == 0 ? 40 : 7));
    std::ranges::generate(values, [&] { return input.number(8); });
    return values;
}

}  // namespace

// Transfers with seeks and flushes between them, then the rest of the file. Fields that do not go
// on in the same direction and order begin at the next whole byte.
void bitFields(Bytes& input) {
    constexpr std::size_t mostOfOneStep = 1200;
    static const std::vector<bool> pattern = [] {
        std::vector<bool> bits;
        for (std::size_t i = 0; i < 8 * (mostOfOneStep + 1500); ++i)
            bits.push_back(i * i % 7 % 2 != 0);
        return bits;
    }();
    BitFile model{pattern};
    model.bits.resize(8 * (mostOfOneStep + input.below(1500)));
    const support::MemoryFile content(model.bytes());
    auto file = openFile(content.path(), {"r+", "n", ""});
    bool isWrite = false;
    while (!input.empty() && model.bit + 8 * mostOfOneStep < model.bits.size()) {
        enum { Seek, Flush, Plain };
        const std::size_t action = input.below(20), choice = input.below(45);
        const bool turns = choice % 5 == 0, swaps = choice % 9 == 0;
        // The current byte is the one partly written, or the one behind that partly read.
        if (action == Seek && isWrite) model.bit -= model.bit % 8;
        if (action <= Plain || turns || swaps) model.align();
        isWrite = isWrite != turns;
        model.bigEndian = model.bigEndian != swaps;
        if (action == Seek) {
            seek(*file, 2, Origin::Current);
            model.bit += 16;
        } else if (action == Flush) {
            requireEqual(std::to_string(flushFile(*file).has_value()), "0", "a flush");
        } else {
            const Elements elements = anyElements(input, action == Plain);
            input.observe(transfer(*file, model, isWrite, elements, anyValues(input)));
        }
        const std::size_t bit = isWrite ? model.bit : model.bit + 7;
        requireEqual(std::to_string(tell(*file)), std::to_string(bit / 8), "the position");
    }
    // To the end and no bit further: what is left of the last byte is no element.
    seek(*file, -static_cast<double>(input.below(400)), Origin::End);
    model.bit = 8 * static_cast<std::size_t>(tell(*file));
    const Elements elements = anyElements(input, input.below(2) == 0);
    transfer(*file, model, false, elements, std::vector<std::uint64_t>(4000));
    requireEqual(std::to_string(endOfFile(*file)), "1", "the end");
    requireEqual(std::to_string(tell(*file)), std::to_string(model.bit / 8), "the end");
    requireEqual(std::to_string(closeFile(std::move(file)).has_value()), "0", "closing");
    requireEqual(content.content(), model.bytes(), "the file");
}

}  // namespace properties
