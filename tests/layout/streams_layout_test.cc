#include "fileio/streams/stream.h"
#include "fileio/text/output_string_stream.h"
#include "fileio/text/tcodn_stream.h"
#include "tests/layout/slots.h"

namespace Orvandeil::FileIO {

template <>
std::vector<layout::Field> LayoutProbe::fields<TcodnStream>() {
    return {FIELD(TcodnStream, converter),  FIELD(TcodnStream, latinFixed),
            FIELD(TcodnStream, utf16),      FIELD(TcodnStream, asciiSoFar),
            FIELD(TcodnStream, readBytes),  FIELD(TcodnStream, oneChar),
            FIELD(TcodnStream, writeBytes), FIELD(TcodnStream, asciiText)};
}

template <>
std::vector<layout::Field> LayoutProbe::fields<outputStringStream>() {
    return {FIELD(outputStringStream, data),   FIELD(outputStringStream, capacity),
            FIELD(outputStringStream, cursor), FIELD(outputStringStream, bufferSize),
            FIELD(outputStringStream, mark),   FIELD(outputStringStream, printScratch)};
}

namespace {

template <class S>
std::vector<layout::Place> streamPlaces() {
    return {SLOT(2, S, getPosition),
            SLOT(3, S, GetNElements),
            SLOT(4, S, PutNElements),
            SLOT(5, S, print),
            SLOT(6, S, EndOfData),
            SLOT(7, S, Rewind),
            SLOT(8, S, setBufferSize),
            SLOT(9, S, needsBufferSize),
            SLOT(10, S, scanOctal),
            SLOT(11, S, scanHex),
            SLOT(12, S, scanUnsignedInteger),
            SLOT(13, S, scanInteger),
            SLOT(14, S, scanIntegerCouldBeHex),
            SLOT(15, S, scanFloat)};
}

TEST(Layout, Streams) {
    struct Opened : stream {
        using stream::errorCode;
    };
    layout::expectPlaces(streamPlaces<stream>());
    EXPECT_EQ(layout::slotOf(&stream::getErrorCode), -1);
    EXPECT_EQ(layout::offsetOf(&Opened::errorCode), sizeof(void*));
}

TEST(Layout, TranscodingStreams) {
    layout::expectPlaces(streamPlaces<TcodnStream>());
    layout::expectPlaces({SLOT(16, TcodnStream, PutNCharacters),  //
                          SLOT(17, TcodnStream, DetectCharset)});
    layout::expectOrder(LayoutProbe::fields<TcodnStream>());
}

TEST(Layout, StringStreams) {
    layout::expectPlaces(streamPlaces<outputStringStream>());
    layout::expectPlaces({SLOT(17, outputStringStream, DetectCharset),  //
                          SLOT(18, outputStringStream, Reset)});
    layout::expectOrder(LayoutProbe::fields<outputStringStream>());
}

}  // namespace
}  // namespace Orvandeil::FileIO
