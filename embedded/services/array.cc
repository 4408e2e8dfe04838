#include "embedded/services/array.h"

#include "embedded/services/array_layout.h"
#include "embedded/services/element_types.h"

#include <algorithm>
#include <array>
#include <cstring>

namespace Orvandeil::FileIO::embedded {
namespace {

Dimensions atLeastTwo(Dimensions dimensions) {
    while (dimensions.size() < 2)
        dimensions.push_back(1);
    return dimensions;
}

// The product of the lengths; one beyond the address space is exhausted memory.
std::size_t checkedCount(const Dimensions& dimensions) {
    std::size_t count = 1;
    bool tooMany = false;
    for (const std::size_t length : dimensions) {
        if (length == 0) return 0;
        tooMany = __builtin_mul_overflow(count, length, &count) || tooMany;
    }
    if (tooMany) vxMemoryRaiseExhausted();
    return count;
}

std::unique_ptr<vxArray> makeBare(vxClassID classID, Dimensions dimensions) {
    auto array = std::make_unique<vxArray>();
    array->classID = classID;
    array->dimensions = std::move(dimensions);
    return array;
}

std::unique_ptr<ArrayContents> makeContents(std::string className) {
    auto contents = std::make_unique<ArrayContents>();
    contents->className = std::move(className);
    return contents;
}

std::unique_ptr<vxArray> makeContainer(vxClassID classID, std::string className,
                                       Dimensions dimensions) {
    auto array = makeBare(classID, std::move(dimensions));
    array->contents = makeContents(std::move(className));
    return array;
}

std::unique_ptr<void, HostBlockDestroyer> copyBlock(const void* source, std::size_t count,
                                                    std::size_t size) {
    if (source == nullptr) return nullptr;
    std::unique_ptr<void, HostBlockDestroyer> block(vxMemoryAllocateZeroedOrRaise(count, size));
    std::memcpy(block.get(), source, count * size);
    return block;
}

std::unique_ptr<ArrayContents> copyContents(const ArrayContents& contents) {
    auto copy = makeContents(contents.className);
    copy->texts = contents.texts;
    for (const ArrayPtr& array : contents.arrays)
        copy->arrays.push_back(copyOf(*array));
    copy->fields = contents.fields;
    copy->functions = contents.functions;
    return copy;
}

}  // namespace

std::size_t elementBytes(vxClassID classID) {
    return withElementType(
        classID, []<class T>(ElementType<T>) { return sizeof(T); }, [] { return std::size_t{0}; });
}

const char* nameOfClass(vxClassID classID) {
    static constexpr std::array<const char*, 18> names = {
        "unknown", "cell",   "struct", "logical", "char",    "unknown",
        "double",  "single", "int8",   "uint8",   "int16",   "uint16",
        "int32",   "uint32", "int64",  "uint64",  "unknown", "object"};
    const auto index = static_cast<std::size_t>(classID);
    return index < names.size() ? names[index] : names[0];
}

std::size_t elementCount(const vxArray& array) {
    return checkedCount(array.dimensions);
}

ArrayPtr makeNumeric(vxClassID classID, Dimensions dimensions, vxComplexity complexity) {
    const std::size_t size = elementBytes(classID);
    auto array = makeBare(classID, atLeastTwo(std::move(dimensions)));
    const std::size_t count = checkedCount(array->dimensions);
    if (size == 0) array->contents = makeContents(nameOfClass(classID));
    if (count > 0 && size > 0) array->real.reset(vxMemoryAllocateZeroedOrRaise(count, size));
    // An empty array may be complex, too.
    if (size > 0 && complexity == vxCOMPLEX) {
        array->imaginary.reset(vxMemoryAllocateZeroedOrRaise(count, size));
    }
    return ArrayPtr(array.release());
}

ArrayPtr makeNumeric(vxClassID classID, Dimensions dimensions, void* block) {
    auto array = makeBare(classID, atLeastTwo(std::move(dimensions)));
    array->real.reset(block);
    return ArrayPtr(array.release());
}

ArrayPtr makeDoubles(std::size_t rows, std::size_t columns, std::span<const double> values) {
    ArrayPtr array = makeNumeric(vxDOUBLE_CLASS, {rows, columns});
    std::copy_n(values.begin(), std::min(values.size(), elementCount(*array)),
                static_cast<double*>(array->real.get()));
    return array;
}

ArrayPtr makeDoubles(std::size_t rows, std::size_t columns, std::initializer_list<double> values) {
    return makeDoubles(rows, columns, std::span<const double>(values.begin(), values.size()));
}

ArrayPtr makeScalar(double value) {
    return ArrayPtr(vxCreateDoubleScalar(value));
}

ArrayPtr makeChars(std::u16string_view text) {
    return ArrayPtr(vxCreateCharRow(text.data(), text.size()));
}

ArrayPtr makeStrings(std::vector<StringElement> texts, Dimensions dimensions) {
    auto array = makeContainer(vxOBJECT_CLASS, "string", atLeastTwo(std::move(dimensions)));
    texts.resize(checkedCount(array->dimensions));
    array->contents->texts = std::move(texts);
    return ArrayPtr(array.release());
}

ArrayPtr makeString(StringElement text) {
    std::vector<StringElement> texts;
    texts.push_back(std::move(text));
    return makeStrings(std::move(texts), {1, 1});
}

ArrayPtr makeObject(std::string className, FunctionTable functions, Dimensions dimensions) {
    auto array =
        makeContainer(vxOBJECT_CLASS, std::move(className), atLeastTwo(std::move(dimensions)));
    array->contents->functions = std::move(functions);
    return ArrayPtr(array.release());
}

ArrayPtr copyOf(const vxArray& array) {
    auto copy = makeBare(array.classID, array.dimensions);
    const std::size_t size = elementBytes(array.classID);
    copy->real = copyBlock(array.real.get(), elementCount(array), size);
    copy->imaginary = copyBlock(array.imaginary.get(), elementCount(array), size);
    if (array.contents) copy->contents = copyContents(*array.contents);
    return ArrayPtr(copy.release());
}

void* realData(vxArray& array) {
    return array.real.get();
}

void* imaginaryData(vxArray& array) {
    return array.imaginary.get();
}

const void* imaginaryData(const vxArray& array) {
    return array.imaginary.get();
}

const vxArray* cellContent(const vxArray& cell) {
    if (cell.classID != vxCELL_CLASS || cell.contents->arrays.empty()) return nullptr;
    return cell.contents->arrays.front().get();
}

const vxArray* structField(const vxArray& structure, std::string_view name) {
    if (structure.classID != vxSTRUCT_CLASS) return nullptr;
    const auto& fields = structure.contents->fields;
    const auto found = std::find(fields.begin(), fields.end(), name);
    if (found == fields.end()) return nullptr;
    return structure.contents->arrays[static_cast<std::size_t>(found - fields.begin())].get();
}

}  // namespace Orvandeil::FileIO::embedded

using namespace Orvandeil::FileIO::embedded;

vxArray* vxCreateNumericMatrix(std::size_t rows, std::size_t columns, vxClassID classID,
                               vxComplexity complexity) {
    return makeNumeric(classID, {rows, columns}, complexity).release();
}

vxArray* vxCreateDoubleScalar(double value) {
    return makeDoubles(1, 1, {value}).release();
}

vxArray* vxCreateCharRow(const char16_t* text, std::size_t length) {
    ArrayPtr array = makeNumeric(vxCHAR_CLASS, {length == 0 ? 0u : 1u, length});
    std::copy_n(text, length, static_cast<char16_t*>(array->real.get()));
    return array.release();
}

vxArray* vxCreateCellScalar(vxArray* content) {
    auto array = makeContainer(vxCELL_CLASS, nameOfClass(vxCELL_CLASS), {1, 1});
    array->contents->arrays.emplace_back();
    array->contents->arrays.back().reset(content);
    return array.release();
}

vxArray* vxCreateStructScalar(std::size_t count, const char* const* names, vxArray* const* values) {
    auto array = makeContainer(vxSTRUCT_CLASS, nameOfClass(vxSTRUCT_CLASS), {1, 1});
    array->contents->fields.assign(names, names + count);
    array->contents->arrays.resize(count);
    for (std::size_t i = 0; i < count; ++i)
        array->contents->arrays[i].reset(values[i]);
    return array.release();
}

void vxArrayDestroy(vxArray* array) noexcept {
    delete array;
}

void vxArraySetRows(vxArray* array, std::size_t rows) {
    array->dimensions[0] = rows;
}

void vxArraySetColumns(vxArray* array, std::size_t columns) {
    array->dimensions[1] = columns;
}

void vxArraySetData(vxArray* array, void* block) {
    array->real.reset(block);
}

void vxArrayMarkScalar(vxArray*) {}  // a scalar has no form of its own here

vxClassID vxArrayClassID(const vxArray* array) {
    return array->classID;
}

const char* vxArrayClassName(const vxArray* array) {
    if (!array->contents) return nameOfClass(array->classID);
    return array->contents->className.c_str();
}

std::size_t vxArrayDimensionCount(const vxArray* array) {
    return array->dimensions.size();
}

const std::size_t* vxArrayDimensions(const vxArray* array) {
    return array->dimensions.data();
}

const void* vxArrayData(const vxArray* array) {
    return array->real.get();
}

bool vxArrayIsComplex(const vxArray* array) {
    return array->imaginary != nullptr;
}

bool vxArrayIsVector(const vxArray* array) {
    const Dimensions& lengths = array->dimensions;
    return lengths.size() == 2 && (lengths[0] == 1 || lengths[1] == 1);
}

bool vxArrayIsScalar(const vxArray* array) {
    const Dimensions& lengths = array->dimensions;
    return std::all_of(lengths.begin(), lengths.end(), [](std::size_t n) { return n == 1; });
}

double vxArrayFirstAsDouble(const vxArray* array) {
    return withElementType(
        array->classID,
        [&]<class T>(ElementType<T>) {
            return static_cast<double>(*static_cast<const T*>(array->real.get()));
        },
        [] { return 0.0; });
}
