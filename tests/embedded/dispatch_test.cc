#include "embedded/services/dispatch.h"

#include "fileio/host/exception.h"

#include <cmath>

#include <gtest/gtest.h>

namespace {

using namespace Orvandeil::FileIO::embedded;
using foundation::core::except::IMsgIDException;

ArrayPtr call(const char* name, std::initializer_list<const vxArray*> inputs) {
    return ArrayPtr(vxDispatchCall(name, inputs.begin(), inputs.size()));
}

std::string identifierRaisedBy(const char* name, std::initializer_list<const vxArray*> inputs) {
    try {
        call(name, inputs);
    } catch (const IMsgIDException& error) {
        return error.GetID();
    }
    return "";
}

std::vector<double> doublesOf(const ArrayPtr& array) {
    if (!array || vxArrayClassID(array.get()) != vxDOUBLE_CLASS) return {};
    const auto* first = static_cast<const double*>(vxArrayData(array.get()));
    return std::vector<double>(first, first + elementCount(*array));
}

ArrayPtr subscriptOf(ArrayPtr index) {
    const char* const names[] = {"type", "subs"};
    vxArray* const values[] = {makeChars(u"()").release(), vxCreateCellScalar(index.release())};
    return ArrayPtr(vxCreateStructScalar(2, names, values));
}

TEST(Dispatch, SizeOfAnything) {
    EXPECT_EQ(doublesOf(call("size", {makeNumeric(vxINT8_CLASS, {2, 0, 4}).get()})),
              (std::vector<double>{2, 0, 4}));
    EXPECT_EQ(doublesOf(call("size", {makeStrings({u"a", u"b"}, {2, 1}).get()})),
              (std::vector<double>{2, 1}));
}

TEST(Dispatch, StringElements) {
    const ArrayPtr strings = makeStrings({u"one", std::nullopt, u""}, {1, 3});
    const ArrayPtr second = subscriptOf(makeScalar(2));
    EXPECT_TRUE(vxStringArrayIsMissing(call("subsref", {strings.get(), second.get()}).get(), 0));
    const ArrayPtr first = call("subsref", {strings.get(), subscriptOf(makeScalar(1)).get()});
    ASSERT_TRUE(vxStringArrayIs(first.get()));
    EXPECT_TRUE(vxStringArrayText(first.get(), 0) == u"one");
    EXPECT_FALSE(vxStringArrayIs(makeChars(u"one").get()));

    for (const double bad : {0.0, 4.0, 1.5, -1.0, double(NAN), double(INFINITY)}) {
        const ArrayPtr index = subscriptOf(makeScalar(bad));
        EXPECT_EQ(identifierRaisedBy("subsref", {strings.get(), index.get()}),
                  "KESTRA:badsubscript");
    }
    const ArrayPtr pair = subscriptOf(makeDoubles(1, 2, {1, 2}));
    EXPECT_EQ(identifierRaisedBy("subsref", {strings.get(), pair.get()}), "KESTRA:badsubscript");
}

TEST(Dispatch, StringConversions) {
    const ArrayPtr word = makeString(u"4.5e1");
    const ArrayPtr text = call("char", {word.get()});
    ASSERT_EQ(vxArrayClassID(text.get()), vxCHAR_CLASS);
    EXPECT_EQ(elementCount(*text), 5u);
    EXPECT_TRUE(vxStringArrayText(call("string", {word.get()}).get(), 0) == u"4.5e1");
    EXPECT_EQ(call("int64", {word.get()}), nullptr);
    EXPECT_EQ(call("uint64", {word.get()}), nullptr);
    EXPECT_EQ(call("int8", {word.get()}), nullptr);

    const ArrayPtr missing = makeString(std::nullopt);
    for (const char* name : {"char", "int64", "uint64"}) {
        EXPECT_EQ(identifierRaisedBy(name, {missing.get()}), "KESTRA:string:MissingNotSupported");
    }
    EXPECT_EQ(identifierRaisedBy("char", {makeStrings({u"a", u"b"}, {1, 2}).get()}),
              "KESTRA:string:MustBeStringScalarOrCharacterVector");
}

TEST(Dispatch, NumbersThatStringsSpell) {
    const struct {
        int line;
        StringElement text;
        double value;
    } rows[] = {
        {__LINE__, u"12", 12},      {__LINE__, u"-1e3", -1000},    {__LINE__, u"+Inf", INFINITY},
        {__LINE__, u"12x", NAN},    {__LINE__, u" 12", NAN},       {__LINE__, u"", NAN},
        {__LINE__, u"\u0661", NAN}, {__LINE__, std::nullopt, NAN},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.line);
        const double value = doublesOf(call("double", {makeString(row.text).get()})).at(0);
        EXPECT_TRUE(value == row.value || (std::isnan(value) && std::isnan(row.value)));
    }
    // One rounding: by way of double this halfway case would go down to the even neighbour.
    const ArrayPtr single = call("single", {makeString(u"1.00000005960464477541").get()});
    ASSERT_EQ(vxArrayClassID(single.get()), vxSINGLE_CLASS);
    EXPECT_EQ(vxArrayFirstAsDouble(single.get()), 1.00000011920928955078125);
}

TEST(Dispatch, DoublesOfNumbers) {
    EXPECT_EQ(doublesOf(call("double", {makeRow<std::int8_t>(vxINT8_CLASS, {-3, 5}).get()})),
              (std::vector<double>{-3, 5}));
    const ArrayPtr complex = makeNumeric(vxSINGLE_CLASS, {1, 1}, vxCOMPLEX);
    *static_cast<float*>(imaginaryData(*complex)) = 2.5F;
    const ArrayPtr doubles = call("double", {complex.get()});
    ASSERT_TRUE(vxArrayIsComplex(doubles.get()));
    EXPECT_EQ(*static_cast<const double*>(imaginaryData(std::as_const(*doubles))), 2.5);
}

TEST(Dispatch, ObjectsAnswerByTheirOwnTable) {
    const ArrayPtr widget = makeObject(
        "Widget",
        {{"size", [](auto) { return makeScalar(7); }},
         {"double", [](auto inputs) { return makeScalar(static_cast<double>(inputs.size())); }}});
    EXPECT_STREQ(vxArrayClassName(widget.get()), "Widget");
    EXPECT_EQ(vxArrayData(widget.get()), nullptr);
    EXPECT_EQ(doublesOf(call("size", {widget.get()})), std::vector<double>{7});
    EXPECT_EQ(doublesOf(call("double", {widget.get(), widget.get()})), std::vector<double>{2});
    EXPECT_EQ(call("char", {widget.get()}), nullptr);
    EXPECT_EQ(call("size", {}), nullptr);
    EXPECT_EQ(call("double", {makeObject("Plain", {}).get()}), nullptr);
}

}  // namespace
