#pragma once

#include <cstddef>
#include <cstring>
#include <vector>

#include <boost/preprocessor/seq/for_each.hpp>
#include <boost/preprocessor/variadic/to_seq.hpp>
#include <gtest/gtest.h>

// Places of virtual operations and fields, read from member pointers as the Itanium C++ ABI lays
// them down: a pointer to a virtual member function holds 1 + 8 × its place in the class's table,
// a pointer to a data member its offset. A virtual destructor takes two places.
namespace layout {

struct Place {
    const char* name;
    std::ptrdiff_t at;
};
using Places = std::vector<Place>;

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

// Virtual operations in a row from place `first` on.
inline void expectSlots(std::ptrdiff_t first, const Places& places) {
    for (const Place& place : places)
        EXPECT_EQ(place.at, first++) << place.name;
}

// Fields in the order of their declaration, the first of them at an offset unless that is -1.
inline void expectOrder(const Places& fields, std::ptrdiff_t first = -1) {
    EXPECT_TRUE(first < 0 || fields.front().at == first) << fields.front().name;
    for (std::size_t i = 1; i < fields.size(); ++i)
        EXPECT_LT(fields[i - 1].at, fields[i].at) << fields[i].name;
}

}  // namespace layout

#define LAYOUT_SLOT(r, Class, member) {#Class "::" #member, layout::slotOf(&Class::member)},
#define LAYOUT_FIELD(r, Class, member) {#Class "::" #member, layout::offsetOf(&Class::member)},

// Lists of members, which are not overloaded, of one class.
#define SLOTS(Class, ...) \
    { BOOST_PP_SEQ_FOR_EACH(LAYOUT_SLOT, Class, BOOST_PP_VARIADIC_TO_SEQ(__VA_ARGS__)) }
#define FIELDS(Class, ...) \
    { BOOST_PP_SEQ_FOR_EACH(LAYOUT_FIELD, Class, BOOST_PP_VARIADIC_TO_SEQ(__VA_ARGS__)) }

namespace Orvandeil::FileIO {

// A friend of the classes whose fields are private, specialised for each of them.
struct LayoutProbe {
    template <class Class>
    static layout::Places fields();
};

}  // namespace Orvandeil::FileIO

#define PRIVATE_FIELDS(Class, ...)                \
    template <>                                   \
    layout::Places LayoutProbe::fields<Class>() { \
        return FIELDS(Class, __VA_ARGS__);        \
    }
