#include "embedded/builtins/open_close.h"
#include "embedded/builtins/positioning.h"
#include "embedded/builtins/text_lines.h"
#include "embedded/services/memory.h"
#include "fileio/buffers/output_buffer.h"
#include "fileio/errors/code_list.h"
#include "fileio/printf/print_format_parser.h"
#include "fileio/printf/printf_controller.h"
#include "fileio/scanf/fin_format_parser.h"
#include "fileio/text/input_string_stream.h"
#include "fileio/text/output_screen_stream.h"
#include "fileio/text/output_string_stream.h"
#include "tests/faults/injection.h"
#include "tests/support/printing.h"
#include "tests/support/raised.h"
#include "tests/support/recorded_console.h"
#include "tests/support/scanning.h"

#include <cerrno>
#include <climits>
#include <cmath>
#include <cstdint>
#include <initializer_list>
#include <unistd.h>

#include <gtest/gtest.h>
#include <sys/resource.h>

// Faults that programs of this kind are known for, a test each.
namespace Orvandeil::FileIO {
namespace {

using embedded::ArrayPtr;
using embedded::makeScalar;
using embedded::OutOfMemoryError;
using fileio_tests::print;
using fileio_tests::raisedBy;
using fileio_tests::toUtf16;

// While it lives, the process can have so many more bytes of memory than it has now.
class MemoryLimit {
public:
    explicit MemoryLimit(std::size_t bytes) {
        getrlimit(RLIMIT_AS, &before);
        std::size_t pages = 0;
        std::FILE* const file = std::fopen("/proc/self/statm", "r");
        EXPECT_EQ(std::fscanf(file, "%zu", &pages), 1);
        std::fclose(file);
        const auto inUse = pages * static_cast<std::size_t>(sysconf(_SC_PAGESIZE));
        const rlimit limit = {inUse + bytes, before.rlim_max};
        setrlimit(RLIMIT_AS, &limit);
    }
    ~MemoryLimit() { setrlimit(RLIMIT_AS, &before); }
    MemoryLimit(const MemoryLimit&) = delete;
    MemoryLimit& operator=(const MemoryLimit&) = delete;

    // Tools that keep books of memory end a process that has none left.
    static bool isBearable() {
#ifdef __SANITIZE_ADDRESS__
        return false;
#else
        return std::getenv("FILEIO_TESTS_UNLIMITED") == nullptr;
#endif
    }

private:
    rlimit before = {};
};

constexpr std::size_t mebibyte = 1 << 20;

TEST(KnownFaults, OutputLongerThanItsPromisedSize) {
    support::RecordedConsole console(vxConsoleOutput());
    FilePermission permission("w", false);
    outputScreenStream screen(stdout, permission);
    for (const int width : {1, 7, 8, 9, 511, 512, 513, 70000}) {
        for (const unsigned long promised : {0UL, ~0UL}) {
            const std::string expected =
                std::string(static_cast<std::size_t>(std::max(width - 2, 0)), ' ') + "7.12";
            outputStringStream string("UTF-8");
            console.text.clear();
            for (TcodnStream* out :
                 {static_cast<TcodnStream*>(&string), static_cast<TcodnStream*>(&screen)}) {
                out->setBufferSize(promised);
                EXPECT_EQ(out->printf("%*d%s", width - 1, 7, "."), std::max(width, 2));
                EXPECT_EQ(out->printf("%d", 12), 2);
                EXPECT_LT(out->printf("%lc", static_cast<wint_t>(0x3042)), 0);
            }
            long bytes = 0;
            string.getPosition(bytes);
            const std::unique_ptr<void, void (*)(void*)> block(string.transferBuffer(),
                                                               vxMemoryFree);
            EXPECT_EQ(std::string(static_cast<char*>(block.get()), static_cast<std::size_t>(bytes)),
                      expected);
            EXPECT_EQ(console.text, expected);
        }
    }
}

TEST(KnownFaults, WidthsAndPrecisionsBeyond32Bits) {
    const ArrayPtr negative = makeScalar(INT_MIN);
    const ArrayPtr value = makeScalar(2.5);
    // printf refuses them, and a string has no errno.
    for (const char* format :
         {"%99999999999d", "%99999999999f", "%2147483646.2147483647e", "%.99999999999f"})
        EXPECT_EQ(print(format, value).summary(), "!0") << format;
    EXPECT_EQ(print("%*d", negative, value).summary(), "!0");
    EXPECT_EQ(print("%.99999999999s", embedded::makeChars(u"abc")).summary(), "abc");
}

TEST(KnownFaults, NumberedArgumentBeyondTheLast) {
    const ArrayPtr one = makeScalar(1);
    for (const char* format :
         {"%2147483647$d", "%99999999999$s", "%1$*2147483647$d", "%1$.*2147483647$f", "%2$c"})
        EXPECT_EQ(print(format, one).summary(), "!-44") << format;
}

// Fields as long as the places that hold them, give or take a few bytes.
TEST(KnownFaults, FieldBuffersAndTheirTerminator) {
    for (std::size_t length = 1; length < 140; ++length) {
        const std::string digits(length, '0');
        const std::string input = digits + "7 x";
        for (const std::string& width : {std::string(), std::to_string(length + 1)}) {
            for (const char letter : {'d', 'i', 'u', 'x', 'o', 'f'}) {
                const std::string format = '%' + width + letter;
                const std::string text = support::scanText(input, format, 1).values;
                const std::string file = support::scanFile(input, format, 1).values;
                EXPECT_TRUE(text == "7" || text == "0") << format << ' ' << length;
                EXPECT_TRUE(file == "7" || file == "0") << format << ' ' << length;
            }
        }
    }
}

// A piece that ends within a character, at every place and in every amount that is asked for.
TEST(KnownFaults, ConvertersThatMakeNoProgress) {
    const std::string bytes = "a\xE2\x82\xAC\xF0\x9F\x98\x80\xE2\x82";
    for (const char* encoding : {"UTF-8", "UTF-16BE", "UTF-32", "ISO-2022-JP", "GB18030", "SCSU"}) {
        for (std::size_t length = 0; length <= bytes.size(); ++length) {
            for (unsigned long units = 1; units < 9; ++units) {
                inputStringStream stream(bytes.data(), static_cast<long>(length), encoding);
                char16_t out[9];
                std::size_t rounds = 0;
                while (stream.GetNCodePoints(out, units, nullptr) != 0 && rounds < 20)
                    ++rounds;
                EXPECT_LT(rounds, 20u) << encoding << ' ' << length << ' ' << units;
            }
        }
    }
}

// A text in memory exhausts it, and a file takes all of the same text.
TEST(KnownFaults, HugePrecisionUnderAMemoryLimit) {
    if (!MemoryLimit::isBearable()) GTEST_SKIP();
    constexpr std::size_t precision = 100000000;
    const ArrayPtr value = makeScalar(-0.1);
    const vxArray* arguments[] = {value.get()};
    for (const std::string form : {"%.*f", "%.*e", "%#.*g", "%.*d"}) {
        std::string format = form;
        const auto text = toUtf16(format.replace(format.find('*'), 1, std::to_string(precision)));
        support::OpenedFile sink("/dev/null", "w");
        outputStringStream string("");
        printfController toFile(text, &sink.stream, arguments, 1);
        printfController toString(text, &string, arguments, 1);
        const MemoryLimit limit(64 * mebibyte);
        ASSERT_EQ(vxMemoryAllocate(precision), nullptr) << "the limit does not bite";
        EXPECT_TRUE(toFile.doPrintf()) << form;
        EXPECT_THROW(toString.doPrintf(), OutOfMemoryError) << form;
    }
}

TEST(KnownFaults, SizeProductsThatWrap) {
    const std::string tooBig = "KESTRA:legacy_two_part:p64bitsize";
    OutputBuffer buffer(vxUINT16_CLASS, 1, 1, 1);
    outputStringStream stream("");
    for (std::size_t tooMany : {SIZE_MAX, SIZE_MAX / 2 + 1}) {
        EXPECT_EQ(raisedBy([&] { buffer.Allocate(tooMany); }), tooBig);
        EXPECT_THROW(stream.PutNElements(tooMany, "", 2), OutOfMemoryError);
        EXPECT_THROW(vxCreateNumericMatrix(tooMany, 3, vxINT8_CLASS, vxREAL), OutOfMemoryError);
        EXPECT_THROW(vxMemoryAllocateZeroedOrRaise(tooMany, 8), OutOfMemoryError);
    }
    EXPECT_THROW(stream.EnsureSpace(SIZE_MAX), OutOfMemoryError);
    SizeAttribute size;
    size.isInfinite = false;
    size.m = size.n = 1UL << 32;
    EXPECT_EQ(raisedBy([&] { size.Adjust(13, 1); }), tooBig);
    EXPECT_EQ(size.m, 1UL << 32);
}

// Every beginning of a format of these tokens: the error is that of an incomplete one.
template <class ErrorOf>
void expectErrorsInside(std::initializer_list<std::u16string_view> tokens, ErrorOf errorOf) {
    std::u16string whole;
    for (const std::u16string_view token : tokens) {
        for (std::size_t length = 1; length <= token.size(); ++length) {
            const std::u16string format = whole + std::u16string(token.substr(0, length));
            EXPECT_EQ(errorOf(format), length < token.size() ? code::InvalidFormat : 0)
                << fileio_tests::toUtf8(format);
        }
        whole += token;
    }
}

TEST(KnownFaults, FormatsThatEndInsideAToken) {
    expectErrorsInside({u"%-5.3ld", u"%%", u"%*.*bx", u"%+ #08.s"}, [](const auto& format) {
        return PrintFormatParser(format, false).getRecordedError();
    });
    expectErrorsInside({u"%*5ld", u"%3[]x-]", u"%[^]a]", u"%lf"}, [](const auto& format) {
        finFormatParser parser(format.c_str(), nullptr);
        parser.InitFormatPieces();
        return parser.getError();
    });
}

TEST(KnownFaults, RewindBeforeTheBeginning) {
    faults::Disk disk("abc");
    support::OpenedFile opened(disk.open("r"), "r", "UTF-8");
    opened.read(2);
    outputStringStream output("UTF-8");
    output.PutString(u"xyz");
    inputStringStream input("abc", 3, "UTF-8");
    char16_t unit = 0;
    input.GetNCodePoints(&unit, 1, nullptr);
    for (const unsigned long tooFar : {4UL, static_cast<unsigned long>(LONG_MAX), ULONG_MAX}) {
        EXPECT_FALSE(opened.stream.Rewind(tooFar));
        EXPECT_EQ(opened.stream.getErrorCode(), EINVAL);
        EXPECT_EQ(opened.position(), 2);
        long position = -1;
        for (stream* string : {static_cast<stream*>(&output), static_cast<stream*>(&input)}) {
            EXPECT_TRUE(string->Rewind(tooFar));
            EXPECT_EQ(string->getPosition(position), 0);
            EXPECT_EQ(position, 0);
        }
    }
}

TEST(KnownFaults, SparseFileBeyondTheMemory) {
    if (!MemoryLimit::isBearable()) GTEST_SKIP();
    const support::TempFile sparse("one\ntwo\n");
    ASSERT_EQ(truncate(sparse.path().c_str(), 10L << 30), 0);
    const MemoryLimit limit(64 * mebibyte);
    auto file = embedded::openFile(sparse.path(), {});
    EXPECT_EQ(embedded::readLine(*file)->text(), u"one");
    EXPECT_EQ(file->stream->GetEncodingName(), "UTF-8");
    EXPECT_EQ(embedded::readLine(*file)->text(), u"two");
    EXPECT_THROW(embedded::readLine(*file), OutOfMemoryError);
    embedded::rewind(*file);
    EXPECT_EQ(embedded::readLine(*file, 2)->text(), u"on");
}

}  // namespace
}  // namespace Orvandeil::FileIO
