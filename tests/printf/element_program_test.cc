#include "embedded/services/memory.h"
#include "fileio/buffers/element_conversion.h"
#include "fileio/host/memory.h"
#include "fileio/printf/printf_controller.h"
#include "fileio/text/output_string_stream.h"
#include "tests/support/arrays.h"
#include "tests/support/printing.h"
#include "tests/support/test_files.h"

#include <bit>
#include <cerrno>
#include <cmath>
#include <cstdint>
#include <optional>
#include <random>

#include <gtest/gtest.h>

// The fast way over the elements of an argument against the plain way, in everything that shows.

using namespace Orvandeil::FileIO;
using namespace Orvandeil::FileIO::embedded;

namespace {

// Classes that the library does not know: they may watch every write, so they see the plain ones.
struct WatchedString : outputStringStream {
    using outputStringStream::outputStringStream;
};
struct WatchedFile : fileStream {
    using fileStream::fileStream;
};

class Generator {
public:
    explicit Generator(unsigned seed) : random(seed) {}

    // Padding of text is written in blocks, of which a failing file counts all or nothing.
    bool padsText = true;

    unsigned below(unsigned end) { return static_cast<unsigned>(random() % end); }
    template <class T, std::size_t N>
    const T& oneOf(const T (&choices)[N]) {
        return choices[below(N)];
    }

    std::string format() {
        std::string text = literal();
        for (unsigned i = below(4) == 0 ? 1 + below(12) : 1; i != 0; --i)
            text += conversion() + literal();
        return text;
    }

    ArrayPtr array() {
        constexpr vxClassID classes[] = {
            vxDOUBLE_CLASS, vxDOUBLE_CLASS, vxDOUBLE_CLASS, vxSINGLE_CLASS, vxLOGICAL_CLASS,
            vxCHAR_CLASS,   vxINT8_CLASS,   vxUINT8_CLASS,  vxINT16_CLASS,  vxUINT16_CLASS,
            vxINT32_CLASS,  vxUINT32_CLASS, vxINT64_CLASS,  vxUINT64_CLASS};
        const std::size_t count = below(3) == 0 ? below(12) : below(1500);
        const unsigned oddity = below(2) == 0 ? 0 : below(60) + 1;
        std::vector<double> values(count);
        for (double& value : values)
            value = oddity != 0 && below(oddity) == 0 ? oddNumber() : ordinaryNumber();
        ArrayPtr array = makeNumeric(oneOf(classes), {1, count});
        AssignToVoidBuffer(vxArrayClassID(array.get()), realData(*array), vxDOUBLE_CLASS,
                           values.data(), count);
        return array;
    }

    ArrayPtr word() {
        if (below(100) == 0) return makeScalar(oddNumber());
        std::u16string text(below(9), u'a');
        for (char16_t& unit : text)
            unit = static_cast<char16_t>(below(30) == 0 ? random() : 'a' + below(26));
        return makeChars(text);
    }

private:
    std::string literal() {
        static const std::string choices[] = {"",
                                              "",
                                              ",",
                                              "\n",
                                              " ",
                                              "%%",
                                              "; %%%% and ",
                                              "\xC3\xA9",
                                              "\xF0\x9F\x98\x80",
                                              std::string(15, '-'),
                                              std::string(16, '='),
                                              std::string(290, '*'),
                                              std::string(400, '+'),
                                              std::string("a\0b", 3)};
        return below(3) != 0 ? oneOf(choices) : choices[2 + below(3)];
    }

    std::string conversion() {
        std::string text = "%";
        for (const char flag : {'-', '+', ' ', '#', '0'}) {
            if (below(6) == 0) text += flag;
        }
        const char letter = "ddiouxXeEfgGcss"[below(15)];
        const bool isText = letter == 'c' || letter == 's';
        if (below(3) == 0 && (padsText || !isText)) {
            text += std::to_string(below(20) == 0 ? below(200) : 1 + below(25));
        }
        if (letter == 'c') return text + letter;
        if (below(3) == 0) text += '.' + std::to_string(below(20) == 0 ? below(150) : below(20));
        if (letter == 'x' && below(8) == 0) text += "btlh"[below(4)];
        return text + letter;
    }

    double ordinaryNumber() {
        switch (below(4)) {
            case 0:
                return below(100000);
            case 1:
                return static_cast<double>(static_cast<int>(random())) / 1000;
            case 2:
                return below(128);
            default:
                return static_cast<double>(random()) / 4294967296 * std::pow(10, below(20));
        }
    }

    double oddNumber() {
        constexpr double odd[] = {NAN,    INFINITY, -INFINITY, -0.0,   0.5,     2.5,     1e300,
                                  5e-324, -1,       233,       0x20AC, 65536,   0x1p63,  -0x1p63,
                                  0x1p64, 1e16,     1234565,   9.9e15, 0.00015, 999999.5};
        if (below(3) != 0) return oneOf(odd);
        const std::uint64_t bits = static_cast<std::uint64_t>(random()) << 32 | random();
        return std::bit_cast<double>(bits);
    }

    std::mt19937 random;
};

struct Job {
    std::u16string format;
    std::vector<ArrayPtr> arrays;
};

Job makeJob(Generator& generate) {
    Job job;
    job.format = fileio_tests::toUtf16(generate.format());
    const bool words = generate.below(4) == 0;
    for (unsigned i = words ? generate.below(300) : generate.below(3) + 1; i != 0; --i)
        job.arrays.push_back(words ? generate.word() : generate.array());
    return job;
}

// What a call left behind, as text.
std::string printTo(TcodnStream& out, const Job& job) {
    std::vector<const vxArray*> list;
    for (const ArrayPtr& array : job.arrays)
        list.push_back(array.get());
    std::string outcome = "no memory to begin with";
    try {
        printfController controller(job.format, &out, list.data(), static_cast<int>(list.size()));
        try {
            outcome = controller.doPrintf() ? "complete" : "ended";
        } catch (const OutOfMemoryError&) {
            outcome = "out of memory";
        }
        const foutFormatPiece* const piece = controller.getCurrentPiece();
        outcome += ' ' + std::to_string(controller.getErrorCode()) + " at " +
                   std::to_string(piece == nullptr ? 0 : piece->getFormatPosition());
    } catch (const OutOfMemoryError&) {
    }
    return outcome + ", stream " + std::to_string(out.getErrorCode());
}

template <class Stream>
std::string printToString(const Job& job, const char* encoding, std::size_t failing) {
    Stream out(encoding);
    std::string outcome;
    {
        std::optional<FailingAllocation> failure;
        if (failing != 0) failure.emplace(failing);
        outcome = printTo(out, job) + (failure && failure->happened() ? " failed" : "");
    }
    long bytes = 0;
    out.getPosition(bytes);
    void* const block = out.transferBuffer();
    outcome += ": " + std::string(static_cast<char*>(block), static_cast<std::size_t>(bytes));
    vxMemoryFree(block);
    return outcome;
}

template <class Stream>
std::string printToFile(const Job& job, const char* encoding, int failing, std::size_t buffer) {
    support::FaultyFile faulty;
    faulty.failingWrite = failing;
    faulty.error = failing % 2 == 0 ? ENOSPC : 0;
    FilePermission permission("w", false);
    std::FILE* const file = faulty.open("w", buffer);
    std::string outcome;
    {
        Stream out(file, encoding, permission, u"file");
        outcome = printTo(out, job) + " wrote " + std::to_string(out.getBytesWritten());
    }
    std::fclose(file);
    return outcome + " in " + std::to_string(faulty.writes) + ": " + faulty.bytes;
}

std::string described(const Job& job) {
    std::string text = fileio_tests::toUtf8(job.format);
    for (const ArrayPtr& array : job.arrays)
        text += " | " + support::shown(array).substr(0, 200);
    return text;
}

constexpr const char* encodings[] = {"", "UTF-8", "ISO-8859-1", "UTF-16LE", "Shift_JIS", "UTF-7"};

constexpr std::size_t bufferSizes[] = {4096, 4100, 8192};

TEST(ElementProgram, LeavesWhatThePlainWayLeaves) {
    Generator generate(1);
    for (int round = 0; round < 1500; ++round) {
        const bool fails = generate.below(2) == 0;
        generate.padsText = !fails;
        const Job job = makeJob(generate);
        const char* const encoding = generate.below(2) == 0 ? "" : generate.oneOf(encodings);
        const std::size_t allocation = fails ? 1 + generate.below(60) : 0;
        ASSERT_EQ(printToString<outputStringStream>(job, encoding, allocation),
                  printToString<WatchedString>(job, encoding, allocation))
            << "string " << encoding << ' ' << allocation << ' ' << described(job);
        const int write = fails ? 1 + static_cast<int>(generate.below(6)) : 0;
        const std::size_t buffer = generate.oneOf(bufferSizes);
        ASSERT_EQ(printToFile<fileStream>(job, encoding, write, buffer),
                  printToFile<WatchedFile>(job, encoding, write, buffer))
            << "file " << encoding << ' ' << write << ' ' << described(job);
    }
}

}  // namespace
