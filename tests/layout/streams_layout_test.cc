#include "fileio/text/input_string_stream.h"
#include "fileio/text/output_string_stream.h"
#include "tests/layout/slots.h"

namespace Orvandeil::FileIO {

PRIVATE_FIELDS(TcodnStream, converter, latinFixed, utf16, asciiSoFar, readBytes, oneChar,
               writeBytes, asciiText)
PRIVATE_FIELDS(inputStringStream, begin, current, end, scratch)
PRIVATE_FIELDS(outputStringStream, data, capacity, cursor, bufferSize, mark, printScratch)

namespace {

template <class S>
void expectStream() {
    layout::expectSlots(
        2, SLOTS(S, getPosition, GetNElements, PutNElements, print, EndOfData, Rewind,
                 setBufferSize, needsBufferSize, scanOctal, scanHex, scanUnsignedInteger,
                 scanInteger, scanIntegerCouldBeHex, scanFloat));
}

TEST(Layout, Streams) {
    struct Opened : stream {
        using stream::errorCode;
    };
    expectStream<stream>();
    EXPECT_EQ(layout::slotOf(&stream::getErrorCode), -1);
    EXPECT_EQ(layout::offsetOf(&Opened::errorCode), sizeof(void*));
    expectStream<TcodnStream>();
    layout::expectSlots(16, SLOTS(TcodnStream, PutNCharacters, DetectCharset));
    layout::expectOrder(LayoutProbe::fields<TcodnStream>());
}

TEST(Layout, StringStreams) {
    expectStream<inputStringStream>();
    layout::expectSlots(17, SLOTS(inputStringStream, DetectCharset, getUTF16Position));
    layout::expectOrder(LayoutProbe::fields<inputStringStream>(), sizeof(TcodnStream));
    expectStream<outputStringStream>();
    layout::expectSlots(17, SLOTS(outputStringStream, DetectCharset, Reset));
    layout::expectOrder(LayoutProbe::fields<outputStringStream>());
}

}  // namespace
}  // namespace Orvandeil::FileIO
