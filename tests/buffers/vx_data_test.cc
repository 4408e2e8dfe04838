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
embedded::HostFunction gives(std::function<ArrayPtr()> make) {
    return [make](Inputs) { return make(); };
}

TEST(VxData, ConvertsElementsOfEveryClass) {
    const ArrayPtr doubles = embedded::makeDoubles(2, 2, {-2.5, 65.5, 1e300, 3});
    const VxData data(doubles.get());
    EXPECT_FALSE(data.isObject());
    EXPECT_EQ(data.getIndexAs<double>(2), 1e300);
    EXPECT_EQ(data.getIndexAs<float>(0), -2.5f);
    EXPECT_EQ(data.getIndexAs<long>(0), -3);
    EXPECT_EQ(data.getIndexAs<long>(2), INT64_MAX);
    EXPECT_EQ(data.getIndexAs<unsigned long>(0), 0u);
    EXPECT_EQ(data.getIndexAs<unsigned long>(2), UINT64_MAX);
    EXPECT_EQ(data.getIndexAs<char16_t>(1), u'B');
    EXPECT_EQ(data.getIndexAs<std::u16string>(1), u"B");

    const ArrayPtr longs =
        embedded::makeRow<std::int64_t>(vxINT64_CLASS, {INT64_MIN, 0x4000000001});
    EXPECT_EQ(VxData(longs.get()).getIndexAs<double>(0), -0x1p63);
    EXPECT_EQ(VxData(longs.get()).getIndexAs<long>(1), 0x4000000001);
    EXPECT_EQ(VxData(longs.get()).getIndexAs<char16_t>(1), 0xFFFF);
    const ArrayPtr chars = embedded::makeChars(u"a\xD800");
    EXPECT_EQ(VxData(chars.get()).getIndexAs<double>(1), 0xD800);

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
        {"char", gives([] { return embedded::makeChars(u"c"); })}};
    const ArrayPtr object = embedded::makeObject(
        "money",
        {{"subsref",
          [&](Inputs inputs) {
              const vxArray* type = embedded::structField(*inputs[1], "type");
              const vxArray* subs = embedded::structField(*inputs[1], "subs");
              const vxArray* position = embedded::cellContent(*subs);
              EXPECT_EQ(VxData(type).getIndexAs<char16_t>(0), u'(');
              EXPECT_EQ(VxData(type).getIndexAs<char16_t>(1), u')');
              asked += std::to_string(vxArrayFirstAsDouble(position)).substr(0, 1);
              return embedded::makeObject("money", elementFunctions);
          }}},
        {2, 2});
    const VxData data(object.get());
    EXPECT_TRUE(data.isObject());
    EXPECT_EQ(data.getIndexAs<double>(0), 2.5);
    EXPECT_EQ(data.getIndexAs<float>(1), 1.5f);
    EXPECT_EQ(data.getIndexAs<long>(2), -7);
    EXPECT_EQ(data.getIndexAs<unsigned long>(3), 7u);
    EXPECT_EQ(data.getIndexAs<char16_t>(2), u'c');
    EXPECT_EQ(data.getIndexAs<std::u16string>(1), u"c");
    EXPECT_EQ(asked, "123432");
    char16_t units[2];
    data.copyIntoChar(units, 2);
    EXPECT_EQ(std::u16string(units, 2), u"cc");
}

ArrayPtr objectOf(const FunctionTable& functions) {
    return embedded::makeObject(
        "money", {{"subsref", gives([=] { return embedded::makeObject("money", functions); })}});
}

TEST(VxData, NamesBothClassesWhenAnObjectDoesNotConvert) {
    const auto two = gives([] { return embedded::makeDoubles(2, 1, {1, 2}); });
    const auto text = gives([] { return embedded::makeChars(u"1"); });
    const struct {
        int line;
        FunctionTable functions;
        const char* raised;
    } rows[] = {
        {__LINE__, {{"single", two}}, "KESTRA:UnableToConvert money double"},
        {__LINE__, {{"double", text}}, "KESTRA:UnableToConvert money double"},
        {__LINE__, {{"double", two}}, "KESTRA:printf:UnableToConvertToOneElement money double"},
    };
    for (const auto& row : rows) {
        const ArrayPtr object = objectOf(row.functions);
        const auto read = [&] { VxData(object.get()).getIndexAs<double>(0); };
        EXPECT_EQ(raisedBy(read), row.raised) << row.line;
    }
    // What is neither plain nor an object is left to the host's functions as well.
    const ArrayPtr cell(vxCreateCellScalar(vxCreateDoubleScalar(1)));
    EXPECT_EQ(raisedBy([&] { VxData(cell.get()).getIndexAs<float>(0); }),
              "KESTRA:UnableToConvert cell single");
}

TEST(VxData, TakesTheTextOfObjects) {
    const auto chars = [](const char16_t* text) {
        return gives([=] { return embedded::makeChars(text); });
    };
    const auto matrix = gives([] { return embedded::makeNumeric(vxCHAR_CLASS, {2, 2}); });
    const auto string = [](embedded::StringElement text) {
        return gives([=] { return embedded::makeString(text); });
    };
    const auto strings = gives([] { return embedded::makeStrings({u"a", u"b"}, {1, 2}); });
    const auto missing = "KESTRA:string:MissingNotSupported";
    const auto shape = "KESTRA:string:MustBeStringScalarOrCharacterVector";
    const auto neither = "KESTRA:UnableToConvert money char string";
    const struct {
        int line;
        FunctionTable functions;
        std::u16string text;
        const char* raised;
    } rows[] = {
        {__LINE__, {{"char", chars(u"one")}, {"string", strings}}, u"one", ""},
        {__LINE__, {{"char", chars(u"")}, {"string", strings}}, u"", ""},
        {__LINE__, {{"char", matrix}, {"string", string(u"two")}}, u"two", ""},
        {__LINE__, {{"string", string(u"three")}}, u"three", ""},
        {__LINE__, {{"string", string(std::nullopt)}}, u"", missing},
        {__LINE__, {{"string", strings}}, u"", shape},
        {__LINE__, {{"char", matrix}, {"string", chars(u"x")}}, u"", neither},
        {__LINE__, {{"double", chars(u"x")}}, u"", neither},
    };
    for (const auto& row : rows) {
        const ArrayPtr object = objectOf(row.functions);
        std::u16string text;
        const auto read = [&] { text = VxData(object.get()).getIndexAs<std::u16string>(0); };
        EXPECT_EQ(raisedBy(read), row.raised) << row.line;
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
