#include "benchmarks/job.h"

#include <cstdio>
#include <fstream>
#include <iterator>
#include <stdexcept>

#include <unicode/ustring.h>

namespace bench {

void Trial::result(std::string_view bytes) {
    if (comparing) bytesOfResult += bytes;
}

void Trial::result(std::u16string_view text) {
    if (!comparing) return;
    std::string bytes(3 * text.size(), '\0');
    std::int32_t written = 0;
    UErrorCode status = U_ZERO_ERROR;
    u_strToUTF8(bytes.data(), static_cast<std::int32_t>(bytes.size()), &written, text.data(),
                static_cast<std::int32_t>(text.size()), &status);
    if (U_FAILURE(status)) throw std::runtime_error("a result is no text");
    bytesOfResult.append(bytes, 0, static_cast<std::size_t>(written));
}

void Trial::resultOfFile(const std::string& path) {
    if (!comparing) return;
    std::ifstream file(path, std::ios::binary);
    bytesOfResult.append(std::istreambuf_iterator<char>(file), {});
}

void removeFile(const std::string& path) {
    std::remove(path.c_str());
}

}  // namespace bench
