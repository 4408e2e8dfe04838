#include "embedded/services/array.h"
#include "fileio/printf/print_format_parser.h"
#include "fileio/scanf/scan_control.h"
#include "fileio/text/input_string_stream.h"
#include "tests/properties/properties.h"
#include "tests/support/printing.h"

#include <algorithm>
#include <bit>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <regex>
#include <string>
#include <vector>

#include <gtest/gtest.h>
#include <unicode/ucnv.h>

namespace properties {
namespace {

using namespace Orvandeil::FileIO;

bool isLong() {
    return std::getenv("FILEIO_LONG") != nullptr;
}

// What the two parsers accept, as the grammars have it.
TEST(Exhaustive, TailsOfOneAndTwoCharactersBehindAPercentSign) {
    const std::regex output(
        "([^%]|%%|%[-+ #0]*([1-9][0-9]*|\\*)?"
        "((\\.(\\*|-?[0-9]*))?([hl]?[diouxX]|[bt][ouxX]|[eEfgGs])|c))*");
    const std::regex input("([^%]|%%|%\\*?(0*[1-9][0-9]*)?([hl]?[diuxXoefgEG]|[sc]))*");
    for (unsigned code = 1; code < 256 * 256; ++code) {
        std::string format = {'%', static_cast<char>(code & 0xFF)};
        if (code >= 256) format += static_cast<char>(code >> 8);
        if (format[1] == '\0') continue;
        std::u16string units;
        for (const char byte : format)
            units += static_cast<char16_t>(static_cast<unsigned char>(byte));
        const PrintFormatParser printed(units, false);
        finFormatParser scanned(units.c_str(), nullptr);
        scanned.InitFormatPieces();
        EXPECT_EQ(printed.getRecordedError(), std::regex_match(format, output) ? 0 : -8) << format;
        EXPECT_EQ(scanned.getError(), std::regex_match(format, input) ? 0 : -8) << format;
    }
}

// Every unit of UTF-16, and every two bytes, by every converter, or by every tenth.
TEST(Exhaustive, UnitsAndPairsOfBytesOfEveryConverter) {
    for (int converter = 0; converter < ucnv_countAvailable(); converter += isLong() ? 1 : 10) {
        const char name = static_cast<char>(converter);
        std::string units = {name, 59};
        for (unsigned code = 0; code < 0x10000; ++code) {
            const char high = static_cast<char>(code >> 8), low = static_cast<char>(code);
            units.append({1, high, low});
            if (units.size() >= 2 + 3 * 59 || code == 0xFFFF) {
                Bytes input(units);
                encoding(input);
                units = {name, 59};
            }
            if (!isLong() && code % 8 != 0) continue;
            const std::string pair = {name, '\xFF', 2, high, low};
            Bytes input(pair);
            decoding(input);
        }
    }
}

// By this library and by the C library.
std::string printed(const std::vector<float>& values) {
    const embedded::ArrayPtr array = embedded::makeNumeric(vxSINGLE_CLASS, {values.size(), 1});
    std::ranges::copy(values, static_cast<float*>(embedded::realData(*array)));
    const std::string text = fileio_tests::print("%.9g\n", array).text;
    std::string wanted;
    for (const float value : values) {
        char digits[32];
        std::snprintf(digits, sizeof digits, "%.9g\n", value);
        wanted += std::isfinite(value) ? digits
                  : std::isnan(value)  ? "NaN\n"
                  : value < 0          ? "-Inf\n"
                                       : "Inf\n";
    }
    EXPECT_TRUE(text == wanted);
    return text;
}

// Nine digits tell every single; all of them in a long run, else every 40,009th. In sixteen parts,
// by sign and the upper bits of the exponent.
class Singles : public testing::TestWithParam<std::uint64_t> {};

std::vector<double> scanned(const std::string& text, std::size_t mostValues) {
    inputStringStream in(text.c_str(), std::ssize(text), "");
    finFormatParser parser(u"%f", &in);
    parser.InitFormatPieces();
    OutputBuffer buffer(parser.getResultClass(), mostValues, mostValues, mostValues);
    unsigned long count = 0;
    scanControl(0, true, count, in, parser, buffer).performMainScan();
    const auto block = buffer.Transfer();
    const auto* const found = static_cast<const double*>(block.get());
    return {found, found + count};
}

TEST_P(Singles, ThroughPrintAndScan) {
    constexpr std::size_t pieceSize = 1 << 16;
    const std::uint64_t step = isLong() ? 1 : 40009;
    const std::uint64_t first = GetParam() << 28, end = first + (1 << 28);
    std::vector<float> values;
    for (std::uint64_t bits = (first + step - 1) / step * step; bits < end; bits += step) {
        values.push_back(std::bit_cast<float>(static_cast<std::uint32_t>(bits)));
        if (values.size() != pieceSize && bits + step < end) continue;
        const std::vector<double> found = scanned(printed(values), values.size());
        ASSERT_EQ(found.size(), values.size());
        for (std::size_t i = 0; i < values.size(); ++i) {
            const auto value = static_cast<float>(found[i]);
            const bool isSame = std::isnan(values[i]) ? std::isnan(value)
                                                      : std::bit_cast<std::uint32_t>(value) ==
                                                            std::bit_cast<std::uint32_t>(values[i]);
            ASSERT_TRUE(isSame) << values[i];
        }
        values.clear();
    }
}

INSTANTIATE_TEST_SUITE_P(Exhaustive, Singles, testing::Range<std::uint64_t>(0, 16));

}  // namespace
}  // namespace properties
