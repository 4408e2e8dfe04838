#include "cli/json_writer.h"

#include "embedded/services/array.h"
#include "embedded/services/element_types.h"
#include "fileio/host/dispatch.h"
#include "fileio/host/text.h"

#include <new>
#include <span>

namespace cli {

namespace embedded = Orvandeil::FileIO::embedded;

void* JsonMemory::Realloc(void* block, std::size_t, std::size_t bytes) {
    if (bytes == 0) {
        std::free(block);
        return nullptr;
    }
    void* const resized = std::realloc(block, bytes);
    if (resized == nullptr) throw std::bad_alloc();
    return resized;
}

JsonWriter& JsonWriter::key(std::string_view name) {
    writer.Key(name.data(), static_cast<rapidjson::SizeType>(name.size()));
    return *this;
}

void JsonWriter::value(std::string_view text) {
    value(vxTextFromNarrow(text.data(), text.size()));
}

void JsonWriter::value(std::u16string_view text) {
    const std::string utf8 = vxTextToNarrow(text.data(), text.size());
    writer.String(utf8.data(), static_cast<rapidjson::SizeType>(utf8.size()));
}

void JsonWriter::numberText(const NumberText& number) {
    std::string_view text = number.view();
    if (!number.isFinite()) return value(text);
    // A bare -0 would be read as the integer 0 and lose its sign.
    if (text == "-0") text = "-0.0";
    writer.RawValue(text.data(), text.size(), rapidjson::kNumberType);
}

void JsonWriter::arrayKeys(const vxArray& array) {
    const std::span dimensions(vxArrayDimensions(&array), vxArrayDimensionCount(&array));
    key("class").value(vxArrayClassName(&array));
    key("size").startList();
    for (const std::size_t length : dimensions)
        value(length);
    endList();
    key("data").startList();
    data(array);
    endList();
    if (vxArrayClassID(&array) != vxCHAR_CLASS) return;
    const auto* units = static_cast<const char16_t*>(vxArrayData(&array));
    key("text").value(std::u16string_view(units, embedded::elementCount(array)));
}

void JsonWriter::data(const vxArray& array) {
    const auto numbers = [&]<class T>(embedded::ElementType<T>) {
        const auto* elements = static_cast<const T*>(vxArrayData(&array));
        for (const T element : std::span(elements, embedded::elementCount(array)))
            value(element);
    };
    embedded::withElementType(vxArrayClassID(&array), numbers, [&] { stringData(array); });
}

void JsonWriter::stringData(const vxArray& array) {
    if (!vxStringArrayIs(&array)) return;
    for (std::size_t i = 0; i < embedded::elementCount(array); ++i) {
        if (vxStringArrayIsMissing(&array, i)) {
            value(nullptr);
        } else {
            value(vxStringArrayText(&array, i));
        }
    }
}

void JsonWriter::restart() {
    buffer.Clear();
    writer.Reset(buffer);
    writer.StartObject();
}

std::string_view JsonWriter::finish() {
    writer.EndObject();
    buffer.Put('\n');
    return {buffer.GetString(), buffer.GetSize()};
}

}  // namespace cli
