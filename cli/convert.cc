#include "cli/plain_writer.h"
#include "cli/suggestion.h"
#include "cli/usage_error.h"
#include "cli/values.h"
#include "cli/verb.h"
#include "embedded/services/dispatch.h"
#include "fileio/buffers/element_conversion.h"
#include "fileio/errors/identifiers.h"
#include "fileio/host/messages.h"

#include <algorithm>
#include <string>

namespace cli {

namespace embedded = Orvandeil::FileIO::embedded;
using embedded::ArrayPtr;

namespace {

void checkClassName(std::string_view name) {
    std::vector<std::string_view> names = elementClassNames();
    names.push_back("string");
    if (std::ranges::find(names, name) == names.end()) {
        throw UsageError(unknownName("class", name, names));
    }
}

// By the host's own function of that name, which may not apply.
ArrayPtr converted(const vxArray& array, const std::string& className) {
    const vxArray* const inputs[] = {&array};
    ArrayPtr result = embedded::callFunction(className, inputs);
    if (!result) {
        vxErrMsgId(KESTRA::catalog_class::raisedAs,
                   KESTRA::catalog_class::key_UnableToConvert(vxArrayClassName(&array),
                                                              className.c_str()));
    }
    return result;
}

ArrayPtr convertedElements(vxArray& array, vxClassID classID) {
    const std::size_t* lengths = vxArrayDimensions(&array);
    ArrayPtr result =
        embedded::makeNumeric(classID, {lengths, lengths + vxArrayDimensionCount(&array)});
    Orvandeil::FileIO::AssignToVoidBuffer(classID, embedded::realData(*result),
                                          Orvandeil::FileIO::VxData(&array),
                                          embedded::elementCount(array));
    return result;
}

void runConvert(const CommandLine& line, Report& report) {
    const std::string className(line.operands()[0]);
    checkClassName(className);
    const ArrayPtr array = readValue(line.operands()[1]);
    const auto target = elementClass(className);
    const bool byElement = target && vxArrayClassID(array.get()) != vxOBJECT_CLASS;
    const ArrayPtr result =
        byElement ? convertedElements(*array, *target) : converted(*array, className);
    if (report.isJson()) {
        report.object().arrayKeys(*result);
    } else {
        printPlain(*result, report);
    }
}

constexpr char details[] =
    "CLASS is logical, char, int8 to int64, uint8 to uint64, single, double or string. Numbers "
    "are\n"
    "rounded, halves away from zero, and saturate; NaN becomes 0 in an integer class. Of complex\n"
    "values the real part is taken. `fileio --help` tells how a VALUE is written.\n";

}  // namespace

const Verb convertVerb = {
    .name = "convert",
    .operands = "CLASS VALUE",
    .summary = "Converts an array to another class",
    .details = details,
    .options = {},
    .leastOperands = 2,
    .mostOperands = 2,
    .run = runConvert,
};

}  // namespace cli
