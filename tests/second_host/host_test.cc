#include "examples/own_host/own_host.h"
#include "fileio/attributes/file_permission.h"
#include "fileio/attributes/size_attribute.h"
#include "fileio/buffers/output_buffer.h"
#include "fileio/errors/identifiers.h"
#include "fileio/host/memory.h"
#include "fileio/printf/escape_sequences.h"
#include "fileio/printf/printf_controller.h"
#include "fileio/text/output_screen_stream.h"
#include "fileio/text/output_string_stream.h"
#include "fileio/text/std_err_stream.h"
#include "tests/support/raised.h"

#include <cmath>

#include <gtest/gtest.h>

namespace {

using namespace Orvandeil::FileIO;
using own_host::Array;
using own_host::chars;
using own_host::doubles;
using own_host::strings;

// Every test leaves the host's memory as it found it.
class SecondHost : public testing::Test {
protected:
    void SetUp() override { blocksBefore = own_host::memory().blocks; }
    void TearDown() override { EXPECT_EQ(own_host::memory().blocks, blocksBefore); }

private:
    std::size_t blocksBefore = 0;
};

// What formatted output prints, or what it raises.
std::string print(const std::u16string& format, std::vector<const vxArray*> arguments) {
    outputStringStream out("UTF-8");
    const auto count = static_cast<int>(arguments.size());
    std::unique_ptr<void, decltype(&vxMemoryFree)> block(nullptr, vxMemoryFree);
    long bytes = 0;
    const std::string raised = fileio_tests::raisedBy([&] {
        printfController(format, &out, arguments.data(), count).doPrintf();
        out.getPosition(bytes);
        block.reset(out.transferBuffer());
    });
    if (!raised.empty()) return raised;
    return {static_cast<const char*>(block.get()), static_cast<std::size_t>(bytes)};
}

TEST_F(SecondHost, FormatsItsArrays) {
    const Array squares = doubles(2, 2, {2, 4, 3, 9});
    const Array word = chars(u"h\u00e9");
    const Array texts = strings({u"one", u"two"});
    const Array complex(vxCreateNumericMatrix(1, 2, vxINT16_CLASS, vxCOMPLEX));
    static_cast<std::int16_t*>(own_host::imaginaryParts(complex.get()))[0] = 7;
    EXPECT_EQ(print(u"%d^2=%d\n", {squares.get()}), "2^2=4\n3^2=9\n");
    EXPECT_EQ(print(u"%s|%.1f|", {word.get(), doubles(1, 1, {2.25}).get()}), "h\u00e9|2.2|");
    EXPECT_EQ(print(u"<%s>", {texts.get()}), "<one><two>");
    EXPECT_EQ(print(u"%d ", {complex.get()}), "0 0 ");
    EXPECT_EQ(print(u"%2$s %1$g", {doubles(1, 1, {HUGE_VAL}).get(), word.get()}), "h\u00e9 Inf");
}

TEST_F(SecondHost, RaisesWithItsOwnMessages) {
    EXPECT_EQ(print(u"%s", {strings({nullptr}).get()}), "KESTRA:string:MissingNotSupported");
    EXPECT_EQ(print(u"%f", {strings({u"1"}).get()}), "KESTRA:UnableToConvert string double");
    try {
        outputStringStream("no such encoding");
        FAIL();
    } catch (const std::exception& error) {
        EXPECT_STREQ(error.what(), "KESTRA:iofun:InvalidEncoding no such encoding");
    }
    std::u16string format = uR"(ab\)";
    EXPECT_TRUE(builtins::util::convertFormatEscSeqs(format, false));
    EXPECT_EQ(own_host::warnings().back(), "KESTRA:printf:NoControlCharacterInFormat");
}

TEST_F(SecondHost, ShowsTheConsole) {
    FilePermission permission;
    const Array text = chars(u"h\u00e9"), number = doubles(1, 1, {3});
    const vxArray* list[] = {text.get(), number.get()};
    outputScreenStream screen(stdout, permission);
    stdErrStream errors(stderr, permission);
    EXPECT_TRUE(printfController(u"%s=%d.", &screen, list, 2).doPrintf());
    EXPECT_TRUE(printfController(u"%s=%d!", &errors, list, 2).doPrintf());
    EXPECT_EQ(own_host::takeOutput(), "h\xE9=3.");
    EXPECT_EQ(own_host::takeErrors(), "h\xE9=3!");
}

TEST_F(SecondHost, ReceivesBuffersAsArrays) {
    OutputBuffer buffer(vxDOUBLE_CLASS, 1, 1, 2);
    for (const float value : {1.5F, 2.5F, 3.5F})
        buffer.AppendData(vxSINGLE_CLASS, &value, 1);
    const Array array(
        buffer.TransferArray(SizeAttribute(doubles(1, 2, {2, HUGE_VAL}).get()), false));
    EXPECT_EQ(vxArrayDimensions(array.get())[0], 2u);
    EXPECT_EQ(vxArrayDimensions(array.get())[1], 2u);
    const auto* elements = static_cast<const double*>(vxArrayData(array.get()));
    EXPECT_EQ(std::vector<double>(elements, elements + 4), (std::vector<double>{1.5, 2.5, 3.5, 0}));
}

// Cuts the memory off after every number of bytes until everything fits: nothing may be lost.
TEST_F(SecondHost, RunsOutOfItsMemory) {
    const Array numbers = doubles(1, 3, {1, 2.5, 3e300});
    const std::size_t limit = own_host::memory().limit;
    std::string printed;
    for (std::size_t bytes = 0; printed != "1;2.500000e+00;3.000000e+300;"; bytes += 64) {
        ASSERT_LT(bytes, 1u << 20) << printed;
        own_host::memory().limit = own_host::memory().bytes + bytes;
        EXPECT_NO_THROW(printed = print(u"%d;", {numbers.get()})) << "no other error may escape";
        own_host::memory().limit = limit;
    }
}

}  // namespace
