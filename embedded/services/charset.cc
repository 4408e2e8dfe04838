#include "embedded/services/charset.h"

#include "fileio/host/text.h"

#include <algorithm>
#include <cstdint>
#include <memory>
#include <utility>
#include <vector>

#include <unicode/ucnv.h>
#include <unicode/ucsdet.h>

namespace Orvandeil::FileIO::embedded {
namespace {

std::vector<std::string>& withdrawnEncodings() {
    static std::vector<std::string> names;
    return names;
}

struct DetectorCloser {
    void operator()(UCharsetDetector* detector) const noexcept { ucsdet_close(detector); }
};
struct ConverterCloser {
    void operator()(UConverter* converter) const noexcept { ucnv_close(converter); }
};

}  // namespace

WithdrawnEncoding::WithdrawnEncoding(std::string canonicalName) {
    withdrawnEncodings().push_back(std::move(canonicalName));
}

WithdrawnEncoding::~WithdrawnEncoding() {
    withdrawnEncodings().pop_back();
}

}  // namespace Orvandeil::FileIO::embedded

using namespace Orvandeil::FileIO::embedded;

bool vxTextEncodingIsSupported(const char* canonicalName) {
    const auto& withdrawn = withdrawnEncodings();
    if (std::count(withdrawn.begin(), withdrawn.end(), canonicalName) != 0) return false;
    UErrorCode status = U_ZERO_ERROR;
    const std::unique_ptr<UConverter, ConverterCloser> converter(ucnv_open(canonicalName, &status));
    return U_SUCCESS(status);
}

std::string vxTextDetectCharset(const char* bytes, std::size_t count, vxConsoleSink&,
                                const std::u16string&) {
    UErrorCode status = U_ZERO_ERROR;
    const std::unique_ptr<UCharsetDetector, DetectorCloser> detector(ucsdet_open(&status));
    const auto length = static_cast<std::int32_t>(std::min<std::size_t>(count, INT32_MAX));
    ucsdet_setText(detector.get(), bytes, length, &status);
    const UCharsetMatch* const match = ucsdet_detect(detector.get(), &status);
    const char* const name = match ? ucsdet_getName(match, &status) : nullptr;
    return U_SUCCESS(status) && name ? name : "UTF-8";
}
