#include "embedded/services/charset.h"

#include "fileio/host/text.h"
#include "fileio/text/owned_converter.h"

#include <algorithm>
#include <cstdint>
#include <dlfcn.h>
#include <memory>
#include <string_view>
#include <utility>
#include <vector>

#include <unicode/ucnv.h>
#include <unicode/ucsdet.h>
#include <unicode/uvernum.h>

// The exported name behind a function of ICU, which is a macro.
#define TEXT_OF(name) #name
#define NAME_OF(function) TEXT_OF(function)

namespace Orvandeil::FileIO::embedded {
namespace {

std::vector<std::string>& withdrawnEncodings() {
    static std::vector<std::string> names;
    return names;
}

// ICU's detector. Its library takes as long to load as a short run of the program, so that only
// detection loads it.
class DetectionLibrary {
public:
    bool isLoaded() const { return complete; }

private:
    // The names carry the version of ICU that this was compiled with.
    template <class Function>
    Function* find(const char* name) {
        void* const found = handle ? dlsym(handle, name) : nullptr;
        complete = complete && found;
        return reinterpret_cast<Function*>(found);
    }

    void* const handle = dlopen("libicui18n.so." U_ICU_VERSION_SHORT, RTLD_LAZY | RTLD_LOCAL);
    bool complete = handle != nullptr;

public:
    decltype(&ucsdet_open) open = find<decltype(ucsdet_open)>(NAME_OF(ucsdet_open));
    decltype(&ucsdet_close) close = find<decltype(ucsdet_close)>(NAME_OF(ucsdet_close));
    decltype(&ucsdet_setText) setText = find<decltype(ucsdet_setText)>(NAME_OF(ucsdet_setText));
    decltype(&ucsdet_detect) detect = find<decltype(ucsdet_detect)>(NAME_OF(ucsdet_detect));
    decltype(&ucsdet_getName) getName = find<decltype(ucsdet_getName)>(NAME_OF(ucsdet_getName));
};

// The detector tells visual order by a suffix that no converter knows.
std::string converterName(std::string_view detected) {
    for (const std::string_view suffix : {"_rtl", "_ltr"}) {
        if (detected.ends_with(suffix)) detected.remove_suffix(suffix.size());
    }
    return std::string(detected);
}

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
    const Orvandeil::FileIO::detail::OwnedConverter converter(ucnv_open(canonicalName, &status));
    return U_SUCCESS(status);
}

std::string vxTextDetectCharset(const char* bytes, std::size_t count, vxConsoleSink&,
                                const std::u16string&) {
    static const DetectionLibrary library;
    if (!library.isLoaded()) return "UTF-8";
    UErrorCode status = U_ZERO_ERROR;
    const std::unique_ptr<UCharsetDetector, decltype(library.close)> detector(library.open(&status),
                                                                              library.close);
    const auto length = static_cast<std::int32_t>(std::min<std::size_t>(count, INT32_MAX));
    library.setText(detector.get(), bytes, length, &status);
    const UCharsetMatch* const match = library.detect(detector.get(), &status);
    const char* const name = match ? library.getName(match, &status) : nullptr;
    return U_SUCCESS(status) && name ? converterName(name) : "UTF-8";
}
