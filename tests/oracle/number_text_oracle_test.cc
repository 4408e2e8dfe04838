#include "embedded/services/array.h"
#include "tests/support/printing.h"

#include <algorithm>
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

constexpr unsigned kinds = 7;

// Values that are hard in their own ways: any bits, few decimals, halves, decimal halves,
// neighbours of powers of ten, whole numbers, singles.
double valueOf(unsigned kind, Random& random) {
    const auto exponent = [&](unsigned count) { return std::pow(10, random() % count); };
    switch (kind) {
        case 0:
            return std::bit_cast<double>(random());
        case 1:
            return (static_cast<double>(random() % 20000001) - 10000000) / exponent(9);
        case 2:
            return std::ldexp(random() >> (11 + random() % 53),
                              static_cast<int>(random() % 120) - 80);
        case 3:
            return (static_cast<double>(random() >> (20 + random() % 40)) * 10 + 5) * exponent(6);
        case 4:
            return std::nextafter(std::pow(10, static_cast<int>(random() % 632) - 323),
                                  random() % 2 == 0 ? 0 : INFINITY);
        case 5:
            return static_cast<double>(static_cast<long>(random()) >> random() % 64);
        default:
            return std::bit_cast<float>(static_cast<std::uint32_t>(random()));
    }
}

// Prints all values by one format, and compares.
template <class Value>
bool agrees(const std::string& format, const std::vector<Value>& values, vxClassID classID) {
    const ArrayPtr array = makeNumeric(classID, {1, values.size()});
    std::copy(values.begin(), values.end(), static_cast<Value*>(realData(*array)));
    std::string wanted;
    for (const Value value : values) {
        char text[600];
        wanted.append(text, static_cast<std::size_t>(
                                std::snprintf(text, sizeof text, format.c_str(), value)));
    }
    const std::string found = fileio_tests::print(format, array).text;
    const auto differs = std::mismatch(found.begin(), found.end(), wanted.begin(), wanted.end());
    if (found != wanted)
        ADD_FAILURE() << format << " near "
                      << std::string(differs.second, wanted.end()).substr(0, 600);
    return found == wanted;
}

TEST(NumberTextOracle, RandomNumbersInEveryPrecision) {
    Random random(20261121);
    const int rounds = isLongRun() ? 4000 : 1;
    std::vector<double> values(isLongRun() ? 1000 : 100);
    for (int round = 0; round < rounds; ++round) {
        for (unsigned kind = 0; kind < kinds; ++kind) {
            for (double& value : values) {
                value = valueOf(kind, random);
                if (!std::isfinite(value)) value = 0.1;
            }
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
