#include "embedded/services/dispatch.h"

#include "tests/support/arrays.h"
#include "tests/support/raised.h"

#include <cmath>

#include <gtest/gtest.h>

namespace {

using namespace Orvandeil::FileIO::embedded;

// What the function returns or raises.
template <class... Inputs>
std::string call(const char* name, const Inputs&... inputs) {
    const std::vector<const vxArray*> list = {inputs.get()...};
    std::string result;
    const std::string raised = fileio_tests::raisedBy(
        [&] { result = support::shown(ArrayPtr(vxDispatchCall(name, list.data(), list.size()))); });
    return raised + result;
}

ArrayPtr subscriptOf(ArrayPtr index) {
    const char* const names[] = {"type", "subs"};
    vxArray* const values[] = {makeChars(u"()").release(), vxCreateCellScalar(index.release())};
    return ArrayPtr(vxCreateStructScalar(2, names, values));
}

TEST(Dispatch, StringElements) {
    const ArrayPtr strings = makeStrings({u"one", std::nullopt, u""}, {3, 1});
    EXPECT_EQ(call("size", strings), "double 1x2: 3 1");
    const char* const elements[] = {"'one'", "missing", "''"};
    for (const int i : {1, 2, 3}) {
        EXPECT_EQ(call("subsref", strings, subscriptOf(makeScalar(i))),
                  std::string("string 1x1: ") + elements[i - 1]);
    }
    for (const double bad : {0.0, 4.0, 1.5, -1.0, double(NAN), double(INFINITY)})
        EXPECT_EQ(call("subsref", strings, subscriptOf(makeScalar(bad))), "KESTRA:badsubscript");
    EXPECT_EQ(call("subsref", strings, subscriptOf(makeDoubles(1, 2, {1, 2}))),
              "KESTRA:badsubscript");
}

TEST(Dispatch, Conversions) {
    EXPECT_EQ(call("int8", makeString(u"4e1")), "none");
    EXPECT_EQ(call("char", makeStrings({u"a", u"b"}, {1, 2})),
              "KESTRA:string:MustBeStringScalarOrCharacterVector");
    EXPECT_EQ(call("double", makeRow<std::int8_t>(vxINT8_CLASS, {-3, 5})), "double 1x2: -3 5");
    const ArrayPtr complex = makeNumeric(vxSINGLE_CLASS, {1, 1, 2}, vxCOMPLEX);
    *static_cast<float*>(imaginaryData(*complex)) = 2.5F;
    EXPECT_EQ(call("size", complex), "double 1x3: 1 1 2");
    EXPECT_EQ(call("double", complex), "double 1x1x2: 0 0 + i 2.5 0");
}

TEST(Dispatch, ObjectsAnswerByTheirOwnTable) {
    const ArrayPtr widget = makeObject(
        "Widget",
        {{"size", [](auto) { return makeScalar(7); }},
         {"double", [](auto inputs) { return makeScalar(static_cast<double>(inputs.size())); }}});
    EXPECT_EQ(support::shown(widget), "Widget 1x1: ");
    EXPECT_EQ(call("size", widget), "double 1x1: 7");
    EXPECT_EQ(call("double", widget, widget), "double 1x1: 2");
    EXPECT_EQ(call("char", widget), "none");
    EXPECT_EQ(call("size"), "none");
    EXPECT_EQ(call("double", makeObject("Plain", {})), "none");
}

}  // namespace
