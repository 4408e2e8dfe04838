#include "fileio/host/arrays.h"

#include "examples/own_host/own_host.h"
#include "fileio/host/dispatch.h"
#include "fileio/host/memory.h"

#include <algorithm>
#include <cstdint>
#include <cstring>
#include <map>
#include <new>
#include <string_view>
#include <utility>
#include <vector>

// Matrices only. What `elements` points to depends on the class: numbers, the arrays of a cell or
// struct, or Texts.
struct vxArray {
    vxClassID classID;
    std::size_t lengths[2];
    void* elements;
    std::size_t contentCount;  // arrays owned by a cell or struct
};

namespace own_host {
namespace {

// The text of an element of a string array; null units: missing.
struct Text {
    char16_t* units;
    std::size_t length;
};

struct ClassRow {
    const char* name;
    std::size_t bytes;
    double (*first)(const void*);
};

template <class T>
double firstOf(const void* elements) {
    return static_cast<double>(*static_cast<const T*>(elements));
}

template <class T>
constexpr ClassRow numeric(const char* name) {
    return {name, sizeof(T), firstOf<T>};
}

constexpr ClassRow noNumbers(const char* name) {
    return {name, 0, nullptr};
}

constexpr ClassRow classes[] = {
    noNumbers("unknown"),
    noNumbers("cell"),
    noNumbers("struct"),
    numeric<std::uint8_t>("logical"),
    numeric<char16_t>("char"),
    noNumbers("unknown"),
    numeric<double>("double"),
    numeric<float>("single"),
    numeric<std::int8_t>("int8"),
    numeric<std::uint8_t>("uint8"),
    numeric<std::int16_t>("int16"),
    numeric<std::uint16_t>("uint16"),
    numeric<std::int32_t>("int32"),
    numeric<std::uint32_t>("uint32"),
    numeric<std::int64_t>("int64"),
    numeric<std::uint64_t>("uint64"),
    noNumbers("unknown"),
    noNumbers("string"),
};

const ClassRow& rowOf(const vxArray* array) {
    return classes[static_cast<std::size_t>(array->classID)];
}

std::map<const vxArray*, void*>& imaginaryBlocks() {
    static std::map<const vxArray*, void*> blocks;
    return blocks;
}

std::size_t countOf(const vxArray* array) {
    return array->lengths[0] * array->lengths[1];
}

Array matrix(vxClassID classID, std::size_t rows, std::size_t columns) {
    void* block = vxMemoryAllocateOrRaise(sizeof(vxArray));
    return Array(new (block) vxArray{classID, {rows, columns}, nullptr, 0});
}

Text* texts(const vxArray* array) {
    return static_cast<Text*>(array->elements);
}

vxArray** contents(const vxArray* array) {
    return static_cast<vxArray**>(array->elements);
}

Array stringOf(const Text& text) {
    Array array = matrix(vxOBJECT_CLASS, 1, 1);
    array->elements = vxMemoryAllocateZeroedOrRaise(1, sizeof(Text));
    if (text.units == nullptr) return array;
    const std::size_t bytes = text.length * sizeof(char16_t);
    texts(array.get())[0] = {static_cast<char16_t*>(vxMemoryAllocateOrRaise(bytes)), text.length};
    std::memcpy(texts(array.get())[0].units, text.units, bytes);
    return array;
}

Array sizeOf(const vxArray* array) {
    const auto rows = static_cast<double>(array->lengths[0]);
    return doubles(1, 2, {rows, static_cast<double>(array->lengths[1])});
}

// The subscript structure holds "type" and "subs", a cell with an index from 1.
Array elementOf(const vxArray* array, const vxArray* structure) {
    const vxArray* index = contents(contents(structure)[1])[0];
    return stringOf(texts(array)[static_cast<std::size_t>(vxArrayFirstAsDouble(index)) - 1]);
}

Array asDoubles(const vxArray* array) {
    const ClassRow& row = rowOf(array);
    if (row.first == nullptr) return nullptr;
    Array result = doubles(array->lengths[0], array->lengths[1], {});
    for (std::size_t i = 0; i < countOf(array); ++i) {
        const char* element = static_cast<const char*>(array->elements) + i * row.bytes;
        static_cast<double*>(result->elements)[i] = row.first(element);
    }
    return result;
}

}  // namespace

Array doubles(std::size_t rows, std::size_t columns, std::initializer_list<double> values) {
    Array array(vxCreateNumericMatrix(rows, columns, vxDOUBLE_CLASS, vxREAL));
    std::copy(values.begin(), values.end(), static_cast<double*>(array->elements));
    return array;
}

Array chars(std::u16string_view text) {
    return Array(vxCreateCharRow(text.data(), text.size()));
}

Array strings(std::initializer_list<const char16_t*> given) {
    Array array = matrix(vxOBJECT_CLASS, 1, given.size());
    array->elements = vxMemoryAllocateZeroedOrRaise(given.size(), sizeof(Text));
    Text* out = texts(array.get());
    for (const char16_t* text : given) {
        if (text != nullptr) {
            const std::u16string_view view(text);
            Array one = stringOf({const_cast<char16_t*>(view.data()), view.size()});
            std::swap(*out, texts(one.get())[0]);
        }
        ++out;
    }
    return array;
}

void* imaginaryParts(const vxArray* array) {
    return imaginaryBlocks().at(array);
}

}  // namespace own_host

using namespace own_host;

vxArray* vxCreateNumericMatrix(std::size_t rows, std::size_t columns, vxClassID classID,
                               vxComplexity complexity) {
    Array array = matrix(classID, rows, columns);
    std::size_t count = 0;
    if (__builtin_mul_overflow(rows, columns, &count)) vxMemoryRaiseExhausted();
    const std::size_t bytes = rowOf(array.get()).bytes;
    array->elements = vxMemoryAllocateZeroedOrRaise(count, bytes);
    if (complexity == vxCOMPLEX) {
        imaginaryBlocks()[array.get()] = vxMemoryAllocateZeroedOrRaise(count, bytes);
    }
    return array.release();
}

vxArray* vxCreateDoubleScalar(double value) {
    return doubles(1, 1, {value}).release();
}

vxArray* vxCreateCharRow(const char16_t* text, std::size_t length) {
    vxArray* array = vxCreateNumericMatrix(length == 0 ? 0 : 1, length, vxCHAR_CLASS, vxREAL);
    std::copy_n(text, length, static_cast<char16_t*>(array->elements));
    return array;
}

vxArray* vxCreateCellScalar(vxArray* content) {
    Array cell = matrix(vxCELL_CLASS, 1, 1);
    cell->elements = vxMemoryAllocateOrRaise(sizeof(vxArray*));
    cell->contentCount = 1;
    contents(cell.get())[0] = content;
    return cell.release();
}

vxArray* vxCreateStructScalar(std::size_t count, const char* const*, vxArray* const* values) {
    Array structure = matrix(vxSTRUCT_CLASS, 1, 1);
    structure->elements = vxMemoryAllocateOrRaise(count * sizeof(vxArray*));
    structure->contentCount = count;
    std::copy_n(values, count, contents(structure.get()));
    return structure.release();
}

void vxArrayDestroy(vxArray* array) noexcept {
    if (array == nullptr) return;
    const auto imaginary = imaginaryBlocks().extract(array);
    if (!imaginary.empty()) vxMemoryFree(imaginary.mapped());
    if (array->elements != nullptr && array->classID == vxOBJECT_CLASS) {
        for (std::size_t i = 0; i < countOf(array); ++i)
            vxMemoryFree(texts(array)[i].units);
    }
    for (std::size_t i = 0; i < array->contentCount; ++i)
        vxArrayDestroy(contents(array)[i]);
    vxMemoryFree(array->elements);
    vxMemoryFree(array);
}

void vxArraySetRows(vxArray* array, std::size_t rows) {
    array->lengths[0] = rows;
}

void vxArraySetColumns(vxArray* array, std::size_t columns) {
    array->lengths[1] = columns;
}

void vxArraySetData(vxArray* array, void* block) {
    vxMemoryFree(array->elements);
    array->elements = block;
}

void vxArrayMarkScalar(vxArray*) {}  // a scalar is like any other array here

vxClassID vxArrayClassID(const vxArray* array) {
    return array->classID;
}

const char* vxArrayClassName(const vxArray* array) {
    return rowOf(array).name;
}

std::size_t vxArrayDimensionCount(const vxArray*) {
    return 2;
}

const std::size_t* vxArrayDimensions(const vxArray* array) {
    return array->lengths;
}

const void* vxArrayData(const vxArray* array) {
    return rowOf(array).first == nullptr ? nullptr : array->elements;
}

bool vxArrayIsComplex(const vxArray* array) {
    return imaginaryBlocks().contains(array);
}

bool vxArrayIsVector(const vxArray* array) {
    return array->lengths[0] == 1 || array->lengths[1] == 1;
}

bool vxArrayIsScalar(const vxArray* array) {
    return array->lengths[0] == 1 && array->lengths[1] == 1;
}

double vxArrayFirstAsDouble(const vxArray* array) {
    return rowOf(array).first(array->elements);
}

vxArray* vxDispatchCall(const char* name, const vxArray* const* inputs, std::size_t count) {
    const std::string_view function = name;
    Array result;
    if (function == "size") result = sizeOf(inputs[0]);
    if (function == "double") result = asDoubles(inputs[0]);
    if (function == "subsref" && count == 2 && vxStringArrayIs(inputs[0])) {
        result = elementOf(inputs[0], inputs[1]);
    }
    return result.release();
}

bool vxStringArrayIs(const vxArray* array) {
    return array->classID == vxOBJECT_CLASS;
}

bool vxStringArrayIsMissing(const vxArray* array, std::size_t index) {
    return texts(array)[index].units == nullptr;
}

std::u16string vxStringArrayText(const vxArray* array, std::size_t index) {
    return std::u16string(texts(array)[index].units, texts(array)[index].length);
}
