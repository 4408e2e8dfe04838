#include "fileio/buffers/vx_data.h"

#include "embedded/services/array.h"
#include "tests/support/raised.h"

#include <cstdint>
#include <functional>

#include <gtest/gtest.h>

namespace {

using namespace Orvandeil::FileIO;
using embedded::ArrayPtr;
using embedded::FunctionTable;
using fileio_tests::raisedBy;
using Inputs = std::span<const vxArray* const>;

// A host function that always gives this array.
embedded::HostFunction gives(const std::function<ArrayPtr()>& make) {
    return [make](Inputs) { return make(); };
}
embedded::HostFunction givesText(const char16_t* text) {
    return gives([=] { return embedded::makeChars(text); });
}
embedded::HostFunction givesString(const embedded::StringElement& text) {
    return gives([=] { return embedded::makeString(text); });
}

TEST(VxData, ConvertsElements) {
    const ArrayPtr doubles = embedded::makeDoubles(2, 2, {-2.5, 65.5, 1e300, 3});
    const VxData data(doubles.get());
    EXPECT_FALSE(data.isObject());
    EXPECT_EQ(data.getIndexAs<double>(2), 1e300);
    EXPECT_EQ(data.getIndexAs<float>(0), -2.5f);
    EXPECT_EQ(data.getIndexAs<long>(0), -3);
    EXPECT_EQ(data.getIndexAs<unsigned long>(2), UINT64_MAX);
    EXPECT_EQ(data.getIndexAs<std::u16string>(1), u"B");
    const ArrayPtr longs =
        embedded::makeRow<std::int64_t>(vxINT64_CLASS, {INT64_MIN, 0x4000000001});
    EXPECT_EQ(VxData(longs.get()).getIndexAs<double>(0), -0x1p63);
    EXPECT_EQ(VxData(longs.get()).getIndexAs<long>(1), 0x4000000001);
    char16_t units[3];
    data.copyIntoChar(units, 3);
    EXPECT_EQ(std::u16string(units, 3), std::u16string({0, u'B', 0xFFFF}));
}

TEST(VxData, FetchesElementsOfObjectsByTheirPosition) {
    std::string asked;
    const FunctionTable elementFunctions = {
        {"double", gives([] { return embedded::makeScalar(2.5); })},
        {"single", gives([] { return embedded::makeRow<float>(vxSINGLE_CLASS, {1.5f}); })},
        {"int64", gives([] { return embedded::makeRow<std::int64_t>(vxINT64_CLASS, {-7}); })},
        {"uint64", gives([] { return embedded::makeRow<std::uint64_t>(vxUINT64_CLASS, {7}); })},
        {"char", givesText(u"c")}};
    const auto subsref = [&](Inputs inputs) {
        const VxData type(embedded::structField(*inputs[1], "type"));
        const vxArray* position = embedded::cellContent(*embedded::structField(*inputs[1], "subs"));
        asked += static_cast<char>(type.getIndexAs<char16_t>(0));
        asked += std::to_string(vxArrayFirstAsDouble(position)).substr(0, 1);
        asked += static_cast<char>(type.getIndexAs<char16_t>(1));
        return embedded::makeObject("money", elementFunctions);
    };
    const ArrayPtr object = embedded::makeObject("money", {{"subsref", subsref}}, {2, 2});
    const VxData data(object.get());
    EXPECT_TRUE(data.isObject());
    EXPECT_EQ(data.getIndexAs<double>(0), 2.5);
    EXPECT_EQ(data.getIndexAs<float>(1), 1.5f);
    EXPECT_EQ(data.getIndexAs<long>(2), -7);
    EXPECT_EQ(data.getIndexAs<unsigned long>(3), 7u);
    EXPECT_EQ(data.getIndexAs<std::u16string>(1), u"c");
    char16_t units[2];
    data.copyIntoChar(units, 2);
    EXPECT_EQ(std::u16string(units, 2), u"cc");
    EXPECT_EQ(asked, "(1)(2)(3)(4)(2)(1)(2)");
}

// What reading an element of an object with these functions raises.
template <class T>
std::string raisedFor(const FunctionTable& functions, T& value) {
    const auto element = gives([=] { return embedded::makeObject("money", functions); });
    const ArrayPtr object = embedded::makeObject("money", {{"subsref", element}});
    return raisedBy([&] { value = VxData(object.get()).getIndexAs<T>(0); });
}

TEST(VxData, NamesBothClassesWhenAnObjectDoesNotConvert) {
    const auto two = gives([] { return embedded::makeDoubles(2, 1, {1, 2}); });
    const auto unable = "KESTRA:UnableToConvert money double";
    double value = 0;
    EXPECT_EQ(raisedFor({{"single", two}}, value), unable);
    EXPECT_EQ(raisedFor({{"double", givesText(u"1")}}, value), unable);
    EXPECT_EQ(raisedFor({{"double", two}}, value),
              "KESTRA:printf:UnableToConvertToOneElement money double");
    // What is neither plain nor an object is left to the host's functions as well.
    const ArrayPtr cell(vxCreateCellScalar(vxCreateDoubleScalar(1)));
    EXPECT_EQ(raisedBy([&] { VxData(cell.get()).getIndexAs<float>(0); }),
              "KESTRA:UnableToConvert cell single");
}

TEST(VxData, TakesTheTextOfObjects) {
    const auto matrix = gives([] { return embedded::makeNumeric(vxCHAR_CLASS, {2, 2}); });
    const auto strings = gives([] { return embedded::makeStrings({u"a", u"b"}, {1, 2}); });
    const auto missing = "KESTRA:string:MissingNotSupported";
    const auto shape = "KESTRA:string:MustBeStringScalarOrCharacterVector";
    const auto neither = "KESTRA:UnableToConvert money char string";
    const struct {
        int line;
        FunctionTable functions;
        std::u16string text;
        const char* raised;
    } rows[] = {{__LINE__, {{"char", givesText(u"one")}, {"string", strings}}, u"one", ""},
                {__LINE__, {{"char", givesText(u"")}, {"string", strings}}, u"", ""},
                {__LINE__, {{"char", matrix}, {"string", givesString(u"two")}}, u"two", ""},
                {__LINE__, {{"string", givesString(std::nullopt)}}, u"", missing},
                {__LINE__, {{"string", strings}}, u"", shape},
                {__LINE__, {{"char", matrix}, {"string", givesText(u"x")}}, u"", neither},
                {__LINE__, {}, u"", neither}};
    for (const auto& row : rows) {
        std::u16string text;
        EXPECT_EQ(raisedFor(row.functions, text), row.raised) << row.line;
        EXPECT_EQ(text, row.text) << row.line;
    }
    const ArrayPtr texts = embedded::makeStrings({u"a", u"bc", std::nullopt}, {1, 3});
    const VxData data(texts.get());
    EXPECT_EQ(data.getIndexAs<std::u16string>(1), u"bc");
    EXPECT_EQ(raisedBy([&] { data.getIndexAs<std::u16string>(2); }), missing);
    EXPECT_EQ(raisedBy([&] { data.getIndexAs<char16_t>(2); }), missing);
    EXPECT_EQ(data.getIndexAs<char16_t>(0), u'a');
}

}  // namespace
