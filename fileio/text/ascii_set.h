#pragma once

#include <array>
#include <cstddef>
#include <vector>

namespace Orvandeil::FileIO::detail {

// A set of ASCII characters other than NUL, looked for in bytes, many at a time.
class AsciiSet {
public:
    template <class Accepts>
    explicit AsciiSet(Accepts accepts) {
        for (unsigned char byte = 1; byte < 0x80; ++byte)
            answers[byte] = accepts(char16_t{byte});
        findGaps();
    }

    static bool isMember(char byte) { return static_cast<signed char>(byte) > 0; }
    bool has(char byte) const { return answers[static_cast<unsigned char>(byte)]; }
    // The number of leading bytes that are in the set.
    std::size_t lengthOf(const char* bytes, std::size_t count) const;

private:
    static constexpr std::size_t blockBytes = 16;
    // Consecutive bytes not in the set, `spread` behind the lowest one, each once for every byte of
    // a block.
    struct Gap {
        std::array<unsigned char, blockBytes> lowest;
        std::array<unsigned char, blockBytes> spread;
    };

    void findGaps();

    std::array<bool, 256> answers{};
    std::vector<Gap> gaps;  // among ASCII; none when there are too many
};

// Widens ASCII. Reads and writes beyond it, up to `room` elements, where that is faster.
void widenAscii(const char* bytes, std::size_t count, std::size_t room, char16_t* out);

}  // namespace Orvandeil::FileIO::detail
