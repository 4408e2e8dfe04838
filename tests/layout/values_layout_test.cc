#include "fileio/attributes/size_attribute.h"
#include "fileio/attributes/skip_attribute.h"
#include "fileio/buffers/output_buffer.h"
#include "tests/layout/slots.h"

namespace Orvandeil::FileIO {

PRIVATE_FIELDS(OutputBuffer, minChunk, maxChunk, currentCapacity, lastRequest, chunks, chunkCounts,
               elementsBeforeLast, classID, typeSize, rollbackStart, rollbackChunk, nextChunk,
               nextElement)

TEST(Layout, NumericAttributes) {
    struct Opened : NumericAttr {
        using NumericAttr::error;
        using NumericAttr::valid;
    };
    layout::expectSlots(2, SLOTS(NumericAttr, IsValid, Validate));
    layout::Places size = FIELDS(Opened, valid, error);
    const layout::Places own = FIELDS(SizeAttribute, m, n, isMatrix, isInfinite);
    size.insert(size.end(), own.begin(), own.end());
    layout::expectOrder(size);
    EXPECT_LT(layout::offsetOf(&Opened::error), layout::offsetOf(&SkipAttribute::skip));
}

TEST(Layout, OutputBuffers) {
    layout::expectOrder(LayoutProbe::fields<OutputBuffer>(), sizeof(void*));
}

}  // namespace Orvandeil::FileIO
