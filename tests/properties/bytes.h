#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

// What properties are checked with: bytes turned into choices, and a way to say what does not hold.
namespace properties {

class Broken : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

// Throws Broken, which tells both texts and where they come from.
void requireEqual(const std::string& found, const std::string& wanted, const std::string& where);

// The parts of a text between separators.
std::vector<std::string> split(const std::string& text, char separator = '|');

// UTF-16 as the bytes that hold it.
inline std::string bytesOf(std::u16string_view text) {
    return {reinterpret_cast<const char*>(text.data()), 2 * text.size()};
}

// Any bytes, which the caller keeps, turned into choices one after another. Used up, they give
// zeros. They also digest what was seen of the tested, so that two builds can be compared.
class Bytes {
public:
    explicit Bytes(std::string_view input) : rest(input) {}

    bool empty() const { return rest.empty(); }
    // As many of the bytes, as a number.
    std::uint64_t number(std::size_t bytes);
    std::size_t below(std::size_t bound) { return number(bound > 256 ? 2 : 1) % bound; }
    // One of several, as likely as the bytes have it.
    template <class Choices>
    const auto& of(const Choices& choices) {
        return std::data(choices)[below(std::size(choices))];
    }

    // A text of up to `most` parts. ASCII stands for itself, higher bytes for parts of the
    // vocabulary, and 0xFF for the end.
    template <class Vocabulary>
    std::string text(const Vocabulary& vocabulary, std::size_t most) {
        std::string result;
        while (!rest.empty() && most-- > 0) {
            const std::uint64_t byte = number(1);
            if (byte == 0xFF) break;
            if (byte < 0x80) result += static_cast<char>(byte);
            if (byte >= 0x80) result += std::data(vocabulary)[byte % std::size(vocabulary)];
        }
        return result;
    }
    // A number of any kind: small, whole, special, any bits.
    double real();

    void observe(std::string_view seen);
    std::uint64_t digest() const { return seenSoFar; }

private:
    std::string_view rest;
    std::uint64_t seenSoFar = 0xCBF29CE484222325;  // FNV-1a
};

}  // namespace properties
