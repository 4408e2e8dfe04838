#pragma once

#include <cstddef>
#include <cstdio>
#include <string_view>

// The least that reading fields can cost: parsed where they stand, and nothing checked that the
// input does not need: short reals have few digits. Fields are separated by blanks and commas. Each
// returns the elements stored.
namespace bench {

std::size_t integersOf(std::string_view text, double* out);
std::size_t realsOf(std::string_view text, double* out);
std::size_t shortRealsOf(std::string_view text, double* out);
// The characters of all fields, one behind the other.
std::size_t wordsOf(std::string_view text, char16_t* out);

// The same from the buffer of a file.
std::size_t integersOf(std::FILE* file, double* out);
std::size_t realsOf(std::FILE* file, double* out);
std::size_t shortRealsOf(std::FILE* file, double* out);
std::size_t wordsOf(std::FILE* file, char16_t* out);

}  // namespace bench
