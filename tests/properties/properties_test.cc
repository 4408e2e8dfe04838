#include "tests/properties/properties.h"

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <random>

#include <gtest/gtest.h>

namespace properties {

void PrintTo(const Property& property, std::ostream* out) {
    *out << property.name;
}

namespace {

using Generator = std::mt19937_64;

std::string anyBytes(Generator& random) {
    std::string bytes(1 + random() % (16ULL << random() % 8), '\0');
    for (char& byte : bytes)
        byte = static_cast<char>(random() % 24 == 0 ? 0xFF : random() >> 56);
    return bytes;
}

// The input is shown as a source text, so that it can be made a file of the corpus by printf.
std::string shown(const std::string& input) {
    std::string text;
    for (const char byte : input) {
        char escape[8];
        std::snprintf(escape, sizeof escape, "\\%03o", static_cast<unsigned char>(byte));
        text += escape;
    }
    return text;
}

class Properties : public testing::TestWithParam<Property> {
protected:
    // Whether the property holds for the input.
    bool holds(const std::string& input, const std::string& name) {
        Bytes bytes(input);
        try {
            GetParam().check(bytes);
            digest = 31 * digest + bytes.digest();
            return true;
        } catch (const std::exception& broken) {
            ADD_FAILURE() << name << ": " << broken.what() << "\ninput " << shown(input);
            return false;
        }
    }

    std::uint64_t digest = 0;
};

TEST_P(Properties, HoldForTheCorpus) {
    const auto folder = std::filesystem::path(FILEIO_CORPUS) / GetParam().name;
    for (const auto& entry : std::filesystem::directory_iterator(folder)) {
        std::ifstream file(entry.path(), std::ios::binary);
        holds({std::istreambuf_iterator<char>(file), {}}, entry.path());
    }
}

// FILEIO_LONG says how many. Builds that do the same print the same digest.
TEST_P(Properties, HoldForRandomInputs) {
    const char* const count = std::getenv("FILEIO_LONG");
    Generator random(7);
    for (int round = 0; round < (count ? std::atoi(count) : 5000); ++round) {
        if (!holds(anyBytes(random), "round " + std::to_string(round))) return;
    }
    if (count)
        std::printf("digest %s %016llx\n", GetParam().name,
                    static_cast<unsigned long long>(digest));
}

INSTANTIATE_TEST_SUITE_P(, Properties, testing::ValuesIn(all().begin(), all().end()),
                         [](const auto& property) { return property.param.name; });

}  // namespace
}  // namespace properties
