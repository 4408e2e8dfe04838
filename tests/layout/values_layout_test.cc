#include "fileio/attributes/numeric_attr.h"
#include "fileio/attributes/size_attribute.h"
#include "fileio/attributes/skip_attribute.h"
#include "fileio/buffers/output_buffer.h"
#include "tests/layout/slots.h"

namespace Orvandeil::FileIO {

template <>
std::vector<layout::Field> LayoutProbe::fields<OutputBuffer>() {
    return {FIELD(OutputBuffer, minChunk),
            FIELD(OutputBuffer, maxChunk),
            FIELD(OutputBuffer, currentCapacity),
            FIELD(OutputBuffer, lastRequest),
            FIELD(OutputBuffer, chunks),
            FIELD(OutputBuffer, chunkCounts),
            FIELD(OutputBuffer, elementsBeforeLast),
            FIELD(OutputBuffer, classID),
            FIELD(OutputBuffer, typeSize),
            FIELD(OutputBuffer, rollbackStart),
            FIELD(OutputBuffer, rollbackChunk),
            FIELD(OutputBuffer, nextChunk),
            FIELD(OutputBuffer, nextElement)};
}

namespace {

struct OpenedAttr : NumericAttr {
    using NumericAttr::error;
    using NumericAttr::valid;
};

TEST(Layout, NumericAttributes) {
    layout::expectPlaces({SLOT(2, NumericAttr, IsValid), SLOT(3, NumericAttr, Validate)});
    layout::expectOrder({FIELD(OpenedAttr, valid), FIELD(OpenedAttr, error),
                         FIELD(SizeAttribute, m), FIELD(SizeAttribute, n),
                         FIELD(SizeAttribute, isMatrix), FIELD(SizeAttribute, isInfinite)});
    layout::expectOrder({FIELD(OpenedAttr, error), FIELD(SkipAttribute, skip)});
}

TEST(Layout, OutputBuffers) {
    const std::vector<layout::Field> fields = LayoutProbe::fields<OutputBuffer>();
    EXPECT_EQ(fields.front().offset, sizeof(void*));
    layout::expectOrder(fields);
}

}  // namespace
}  // namespace Orvandeil::FileIO
