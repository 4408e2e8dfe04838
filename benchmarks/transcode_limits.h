#pragma once

#include <cstddef>
#include <string>
#include <string_view>

// Transcoding without any check, for text that is known to be well-formed and to have no
// characters beyond the Basic Multilingual Plane: runs of ASCII sixteen bytes at a time, other
// characters one by one. The encodings are those of the transcoding jobs, by ICU's names.
namespace bench {

std::size_t limitDecode(std::string_view encoding, const std::string& bytes, char16_t* out);
std::size_t limitEncode(std::string_view encoding, const std::u16string& text, char* out);

}  // namespace bench
