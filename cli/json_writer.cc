#include "cli/json_writer.h"

#include "cli/utf8_slices.h"
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

void JsonBlock::passOn() {
    sink({text, used});
    used = 0;
    isPassedOn = true;
}

bool JsonBlock::takeBack() {
    if (isPassedOn) return false;
    used = 0;
    return true;
}

void JsonWriter::Writer::putEscaped(char c) {
    constexpr std::string_view named = "\"\\\b\f\n\r\t", names = "\"\\bfnrt";
    constexpr std::string_view digits = "0123456789ABCDEF";
    const std::size_t at = named.find(c);
    const auto code = static_cast<unsigned char>(c);
    os_->Put('\\');
    if (at != named.npos) return os_->Put(names[at]);
    for (const char letter : {'u', '0', '0', digits[code / 16u], digits[code % 16u]})
        os_->Put(letter);
}

// Of any length, without a copy of all of it.
void JsonWriter::Writer::longString(std::u16string_view text) {
    Prefix(rapidjson::kStringType);
    os_->Put('"');
    const auto put = [this](std::string_view slice) {
        for (const char c : slice) {
            const bool isPlain = static_cast<unsigned char>(c) >= ' ' && c != '"' && c != '\\';
            isPlain ? os_->Put(c) : putEscaped(c);
        }
    };
    try {
        forEachUtf8Slice(text, put);
    } catch (...) {
        // The object stays one, with the text cut short.
        os_->Put('"');
        throw;
    }
    os_->Put('"');
}

void JsonWriter::Writer::endParts() {
    for (;;) {
        const auto* const level = level_stack_.Top<Level>();
        const bool isInside = level_stack_.GetSize() > sizeof(Level);
        const bool isList = level->inArray;
        if (!isList && level->valueCount % 2 != 0) Null();
        if (!isInside) return;
        isList ? EndArray() : EndObject();
    }
}

JsonWriter& JsonWriter::key(std::string_view name) {
    writer.Key(name.data(), static_cast<rapidjson::SizeType>(name.size()));
    return *this;
}

void JsonWriter::value(std::string_view text) {
    value(vxTextFromNarrow(text.data(), text.size()));
}

void JsonWriter::value(std::u16string_view text) {
    writer.longString(text);
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
    if (!block.takeBack()) return writer.endParts();
    writer.Reset(block);
    writer.StartObject();
}

void JsonWriter::finish() {
    writer.EndObject();
    block.Put('\n');
    block.passOn();
}

}  // namespace cli
