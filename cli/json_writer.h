#pragma once

#include "cli/number_text.h"
#include "fileio/host/arrays.h"

#include <concepts>
#include <cstddef>
#include <cstdlib>
#include <string>
#include <string_view>

#include <rapidjson/stringbuffer.h>
#include <rapidjson/writer.h>

namespace cli {

// Memory for the writer, whose own allocators do not look whether they got any.
struct JsonMemory {
    static constexpr bool kNeedFree = true;
    void* Malloc(std::size_t bytes) { return Realloc(nullptr, 0, bytes); }
    void* Realloc(void* block, std::size_t, std::size_t bytes);
    static void Free(void* block) { std::free(block); }
};

// One JSON object, written key by key into memory. It is open from the beginning.
class JsonWriter {
public:
    JsonWriter() { writer.StartObject(); }
    JsonWriter(const JsonWriter&) = delete;
    JsonWriter& operator=(const JsonWriter&) = delete;

    JsonWriter& key(std::string_view name);

    // Numbers are exact; not-a-number and the infinities become the strings "NaN", "Inf", "-Inf".
    template <class T>
    requires(std::integral<T> || std::floating_point<T>) void value(T number) {
        numberText(NumberText(number));
    }
    void value(bool truth) { writer.Bool(truth); }
    // UTF-8; malformed bytes become U+FFFD, so that the object stays valid.
    void value(std::string_view text);
    void value(const char* text) { value(std::string_view(text)); }
    // An unpaired surrogate becomes U+FFFD.
    void value(std::u16string_view text);
    void value(const std::string& text) { value(std::string_view(text)); }
    void value(const std::u16string& text) { value(std::u16string_view(text)); }
    void value(std::nullptr_t) { writer.Null(); }

    void startList() { writer.StartArray(); }
    void endList() { writer.EndArray(); }
    void startObject() { writer.StartObject(); }
    void endObject() { writer.EndObject(); }

    // The keys `class`, `size` and `data` (column-major), and `text` for char data. The elements
    // of a string array are texts, missing ones null.
    void arrayKeys(const vxArray& array);

    // Starts the object anew, without a key.
    void restart();

    // Closes the object and gives its text, one line with its end.
    std::string_view finish();

private:
    void numberText(const NumberText& number);
    void data(const vxArray& array);
    void stringData(const vxArray& array);

    using Encoding = rapidjson::UTF8<>;
    using Buffer = rapidjson::GenericStringBuffer<Encoding, JsonMemory>;
    Buffer buffer;
    rapidjson::Writer<Buffer, Encoding, Encoding, JsonMemory> writer{buffer};
};

}  // namespace cli
