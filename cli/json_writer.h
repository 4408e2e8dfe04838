#pragma once

#include "cli/number_text.h"
#include "fileio/host/arrays.h"

#include <concepts>
#include <cstddef>
#include <cstdlib>
#include <functional>
#include <string>
#include <string_view>
#include <utility>

#include <rapidjson/writer.h>

namespace cli {

// Memory for the writer, whose own allocators do not look whether they got any.
struct JsonMemory {
    static constexpr bool kNeedFree = true;
    void* Malloc(std::size_t bytes) { return Realloc(nullptr, 0, bytes); }
    void* Realloc(void* block, std::size_t, std::size_t bytes);
    static void Free(void* block) { std::free(block); }
};

// What the writer writes into: a block that is passed on whenever it is full.
class JsonBlock {
public:
    using Ch = char;
    using Sink = std::function<void(std::string_view)>;

    explicit JsonBlock(Sink receiver) : sink(std::move(receiver)) {}

    void Put(char c) {
        if (used == sizeof text) passOn();
        text[used++] = c;
    }
    void Flush() {}

    void passOn();
    // Forgets the text unless a part of it is gone already; whether it did.
    bool takeBack();

private:
    Sink sink;
    std::size_t used = 0;
    bool isPassedOn = false;
    char text[65536];
};

// One JSON object, written key by key into a sink. It is open from the beginning.
class JsonWriter {
public:
    explicit JsonWriter(JsonBlock::Sink sink) : block(std::move(sink)) { writer.StartObject(); }
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

    // Starts the object anew, without a key. When a part of it is gone, ends what was begun within
    // it instead, a key without a value by null.
    void restart();

    // Closes the object, one line with its end.
    void finish();

private:
    void numberText(const NumberText& number);
    void data(const vxArray& array);
    void stringData(const vxArray& array);

    using Encoding = rapidjson::UTF8<>;
    struct Writer : rapidjson::Writer<JsonBlock, Encoding, Encoding, JsonMemory> {
        using rapidjson::Writer<JsonBlock, Encoding, Encoding, JsonMemory>::Writer;
        void putEscaped(char c);
        void longString(std::u16string_view text);
        void endParts();
    };
    JsonBlock block;
    Writer writer{block};
};

}  // namespace cli
