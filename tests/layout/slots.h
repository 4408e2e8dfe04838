#pragma once

#include <cstddef>
#include <cstring>
#include <vector>

#include <gtest/gtest.h>

// Places of virtual operations and fields, read from member pointers as the Itanium C++ ABI lays
// them down: a pointer to a virtual member function holds 1 + 8 × its place in the class's table,
// a pointer to a data member its offset. A virtual destructor takes two places.
//
// One table per class:
//
//   TEST(Layout, Stream) {
//       expectPlaces({SLOT(2, stream, getPosition), SLOT(3, stream, GetNElements)});
//   }
namespace layout {

struct Place {
    int line;
    const char* name;
    std::ptrdiff_t expected;
    std::ptrdiff_t actual;
};

// -1 for a member function that is not virtual.
template <class Member>
std::ptrdiff_t slotOf(Member member) {
    std::ptrdiff_t words[2];
    static_assert(sizeof member == sizeof words);
    std::memcpy(words, &member, sizeof words);
    return words[0] % 8 == 1 ? words[0] / 8 : -1;
}

template <class Class, class Field>
std::ptrdiff_t offsetOf(Field Class::*field) {
    std::ptrdiff_t offset;
    static_assert(sizeof field == sizeof offset);
    std::memcpy(&offset, &field, sizeof offset);
    return offset;
}

inline void expectPlaces(const std::vector<Place>& places) {
    for (const Place& place : places) {
        EXPECT_EQ(place.actual, place.expected) << place.name << ", line " << place.line;
    }
}

struct Field {
    int line;
    const char* name;
    std::ptrdiff_t offset;
};

// Fields in the order of their declaration.
inline void expectOrder(const std::vector<Field>& fields) {
    for (std::size_t i = 1; i < fields.size(); ++i) {
        EXPECT_LT(fields[i - 1].offset, fields[i].offset)
            << fields[i].name << ", line " << fields[i].line;
    }
}

}  // namespace layout

// `member` is not overloaded; protected members are named through a class derived for the test.
#define SLOT(place, Class, member)                               \
    layout::Place {                                              \
        __LINE__, #member, place, layout::slotOf(&Class::member) \
    }
#define FIELD(Class, member)                                \
    layout::Field {                                         \
        __LINE__, #member, layout::offsetOf(&Class::member) \
    }

namespace Orvandeil::FileIO {

// A friend of the classes whose fields are private. Tests specialise it, once per class:
//
//   template <>
//   std::vector<layout::Field> LayoutProbe::fields<OutputBuffer>() {
//       return {FIELD(OutputBuffer, minChunk), FIELD(OutputBuffer, maxChunk)};
//   }
struct LayoutProbe {
    template <class Class>
    static std::vector<layout::Field> fields();
};

}  // namespace Orvandeil::FileIO
