#include "fileio/text/input_string_stream.h"
#include "tests/layout/slots.h"

namespace Orvandeil::FileIO {

template <>
std::vector<layout::Field> LayoutProbe::fields<inputStringStream>() {
    return {FIELD(inputStringStream, begin), FIELD(inputStringStream, current),
            FIELD(inputStringStream, end), FIELD(inputStringStream, scratch)};
}

namespace {

TEST(Layout, InputStringStreams) {
    layout::expectPlaces({SLOT(2, inputStringStream, getPosition),
                          SLOT(15, inputStringStream, scanFloat),
                          SLOT(17, inputStringStream, DetectCharset),
                          SLOT(18, inputStringStream, getUTF16Position)});
    const std::vector<layout::Field> fields = LayoutProbe::fields<inputStringStream>();
    layout::expectOrder(fields);
    EXPECT_EQ(fields.front().offset, sizeof(TcodnStream));
}

}  // namespace
}  // namespace Orvandeil::FileIO
