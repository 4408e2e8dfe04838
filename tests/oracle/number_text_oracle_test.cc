#include "embedded/services/array.h"
#include "fileio/host/memory.h"
#include "fileio/printf/printf_controller.h"
#include "fileio/text/output_string_stream.h"
#include "tests/support/printing.h"

#include <bit>
#include <cmath>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <random>
#include <vector>

#include <gtest/gtest.h>

// Numbers by the block against the C library's printf. FILEIO_LONG=1 makes hours of it.

using namespace Orvandeil::FileIO;
using namespace Orvandeil::FileIO::embedded;

namespace {

using Random = std::mt19937_64;

bool isLongRun() {
    const char* const wish = std::getenv("FILEIO_LONG");
    return wish != nullptr && *wish == '1';
}

double finite(double value) {
    return std::isfinite(value) ? value : 0.1;
}

// Each makes one kind of values that are hard in their own way.
double anyBits(Random& random) {
    return finite(std::bit_cast<double>(random()));
}
double fewDecimals(Random& random) {
    return static_cast<double>(static_cast<long>(random() % 20000001) - 10000000) /
           std::pow(10, random() % 9);
}
double halves(Random& random) {
    return std::ldexp(static_cast<double>(random() >> (11 + random() % 53)),
                      static_cast<int>(random() % 120) - 80);
}
double decimalHalves(Random& random) {
    return (static_cast<double>(random() >> (20 + random() % 40)) * 10 + 5) *
           std::pow(10, random() % 6);
}
double nearPowersOfTen(Random& random) {
    const double power = std::pow(10, static_cast<int>(random() % 632) - 323);
    return finite(std::nextafter(power, random() % 2 == 0 ? 0 : INFINITY));
}
double wholeNumbers(Random& random) {
    return static_cast<double>(static_cast<long>(random()) >> random() % 64);
}
double singles(Random& random) {
    return finite(std::bit_cast<float>(static_cast<std::uint32_t>(random())));
}

constexpr double (*kinds[])(Random&) = {anyBits,         fewDecimals,  halves, decimalHalves,
                                        nearPowersOfTen, wholeNumbers, singles};

std::u16string printedText(const std::string& format, const vxArray* array) {
    outputStringStream out("");
    printfController controller(fileio_tests::toUtf16(format), &out, &array, 1);
    EXPECT_TRUE(controller.doPrintf());
    long bytes = 0;
    out.getPosition(bytes);
    void* const block = out.transferBuffer();
    std::u16string text(static_cast<char16_t*>(block), static_cast<std::size_t>(bytes) / 2);
    vxMemoryFree(block);
    return text;
}

// Prints all values by one format that ends in a line feed, and compares line by line.
template <class Value>
bool agrees(const std::string& format, const std::vector<Value>& values, vxClassID classID) {
    const ArrayPtr array = makeNumeric(classID, {1, values.size()});
    std::copy(values.begin(), values.end(), static_cast<Value*>(realData(*array)));
    const std::u16string text = printedText(format, array.get());
    const char16_t* next = text.data();
    for (const Value value : values) {
        char line[600];
        const int length = std::snprintf(line, sizeof line, format.c_str(), value);
        if (!std::equal(line, line + length, next)) {
            ADD_FAILURE() << format << " of " << line << " printed "
                          << fileio_tests::toUtf8({next, static_cast<std::size_t>(length)});
            return false;
        }
        next += length;
    }
    return next == text.data() + text.size();
}

TEST(NumberTextOracle, RandomNumbersInEveryPrecision) {
    Random random(20261121);
    const int rounds = isLongRun() ? 4000 : 1;
    std::vector<double> values(isLongRun() ? 1000 : 100);
    for (int round = 0; round < rounds; ++round) {
        for (const auto kind : kinds) {
            for (double& value : values)
                value = kind(random);
            for (int precision = 0; precision <= 17; ++precision) {
                for (const char conversion : {'e', 'f', 'g'}) {
                    const std::string format = "%." + std::to_string(precision) + conversion + '\n';
                    ASSERT_TRUE(agrees(format, values, vxDOUBLE_CLASS));
                }
            }
        }
    }
}

TEST(NumberTextOracle, EverySingle) {
    constexpr std::size_t blockValues = 1 << 16;
    const std::uint64_t step = isLongRun() ? 1 : 99991;
    std::vector<float> values;
    for (std::uint64_t bits = 0; bits >> 32 == 0; bits += step) {
        values.push_back(std::bit_cast<float>(static_cast<std::uint32_t>(bits)));
        if (!std::isfinite(values.back())) values.pop_back();
        if (values.size() < blockValues && (bits + step) >> 32 == 0) continue;
        ASSERT_TRUE(agrees("%.9g\n", values, vxSINGLE_CLASS));
        values.clear();
    }
}

}  // namespace
