#include "cli/number_text.h"

#include <random>
#include <string>

#include <gtest/gtest.h>

namespace {

// The standard library's shortest text, for numbers that are not written out as whole ones.
std::string shortest(double value) {
    char text[32];
    return {text, std::to_chars(text, text + sizeof text, value).ptr};
}

// Decimals of 1 to 17 digits around and beyond what the fast way takes, and their neighbours.
TEST(NumberText, AgreesWithTheStandardLibrary) {
    std::mt19937_64 random(11);
    int rounds = 0;
    for (int tries = 0; tries < 300000; ++tries) {
        const std::string digits = std::to_string(random()).substr(0, 1 + random() % 17);
        const int exponent = static_cast<int>(random() % 40) - 25;
        const std::string sign = random() % 2 == 0 ? "-" : "";
        const double decimal = std::stod(sign + digits + 'e' + std::to_string(exponent));
        for (const double value : {decimal, std::nextafter(decimal, 0)}) {
            if (std::trunc(value) == value) continue;
            ASSERT_EQ(cli::NumberText(value).view(), shortest(value));
            rounds += 1;
        }
    }
    EXPECT_GT(rounds, 300000);
}

}  // namespace
