#include "fileio/text/tcodn_stream.h"

#include "fileio/errors/code_list.h"
#include "fileio/errors/identifiers.h"
#include "fileio/host/messages.h"
#include "fileio/host/text.h"
#include "fileio/text/direct_transcoding.h"

#include <algorithm>
#include <array>
#include <clocale>
#include <cstring>
#include <utility>

namespace Orvandeil::FileIO {
namespace {

// ICU's names of the encodings whose text holds no surrogates to filter.
constexpr std::array latinFixedNames = {"ibm-5348_P100-1997", "ibm-943_P15A-2003", "ISO-8859-1",
                                        "US-ASCII"};

constexpr const char* unitEncoding = "UTF-16";

struct StatusCode {
    UErrorCode status;
    int code;
};
constexpr std::array statusCodes = {
    StatusCode{U_INVALID_CHAR_FOUND, code::InvalidChar},
    StatusCode{U_TRUNCATED_CHAR_FOUND, code::TruncatedChar},
    StatusCode{U_ILLEGAL_CHAR_FOUND, code::IllegalChar},
    StatusCode{U_INVALID_TABLE_FORMAT, code::InvalidTableFormat},
    StatusCode{U_BUFFER_OVERFLOW_ERROR, code::BufferOverflow},
};

// The formatted numbers of the standard library need '.' as their decimal point. Setting a locale
// is slow and touches the whole process, so it is asked for first.
void useCNumericLocale() {
    const char* current = std::setlocale(LC_NUMERIC, nullptr);
    if (!current || std::strcmp(current, "C") != 0) std::setlocale(LC_NUMERIC, "C");
}

const char* nameOf(const UConverter* converter) {
    UErrorCode status = U_ZERO_ERROR;
    const char* name = ucnv_getName(converter, &status);
    return U_SUCCESS(status) && name ? name : "";
}

// Without asking the locale: most names differ at once.
bool sameName(const char* a, const char* b) {
    const auto lower = [](char letter) {
        return letter >= 'A' && letter <= 'Z' ? static_cast<char>(letter | 0x20) : letter;
    };
    for (; lower(*a) == lower(*b); ++a, ++b) {
        if (*a == 0) return true;
    }
    return false;
}

}  // namespace

TcodnStream::TcodnStream(std::string encoding)
    : utf16(encoding == unitEncoding), asciiSoFar(encoding.empty()) {
    useCNumericLocale();
    if (!encoding.empty() && !utf16) openConverter(encoding);
}

TcodnStream::~TcodnStream() {
    ucnv_close(converter);
}

void TcodnStream::openConverter(const std::string& name) {
    UErrorCode status = U_ZERO_ERROR;
    converter = ucnv_open(name.c_str(), &status);
    if (U_FAILURE(status)) vxErrMsgId(KESTRA::iofun::InvalidEncoding(name));
    SetEncodingSpecificFlags();
}

UConverter* TcodnStream::GetConv(unsigned long n) {
    if (!converter) openDetected(utf16 ? unitEncoding : DetectCharset(n));
    return converter;
}

void TcodnStream::openDetected(const std::string& detected) {
    openConverter(detected.empty() ? "UTF-8" : detected);
}

// Opening a converter takes longer than printing a few numbers, and units need none.
bool TcodnStream::writesUnits() {
    if (converter || utf16) return utf16;
    const std::string detected = DetectCharset(0);
    utf16 = detected == unitEncoding;
    if (!utf16) openDetected(detected);
    return utf16;
}

std::string TcodnStream::GetEncodingName() {
    return vxTextCanonicalEncodingName(nameOf(GetConv(0)));
}

void TcodnStream::SetEncodingSpecificFlags() {
    directForm = detail::directFormOf(converter);
    // The most frequent encoding is neither.
    const char* const name = directForm == detail::DirectForm::Utf8 ? "" : nameOf(converter);
    latinFixed = std::any_of(latinFixedNames.begin(), latinFixedNames.end(),
                             [name](const char* latin) { return sameName(name, latin); });
    utf16 = sameName(name, "UTF-16");
    asciiTransparent = detail::isAsciiTransparent(directForm);
    byteTable = nullptr;
}

// Looked for where it is needed first: opening an encoding shall be quick.
const detail::ByteTable* TcodnStream::tableOfConverter() {
    if (directForm == detail::DirectForm::Table && !byteTable) {
        byteTable = &detail::ByteTable::of(converter);
    }
    return byteTable;
}

void TcodnStream::CheckStatus(UErrorCode status) {
    if (!U_FAILURE(status)) return;
    const auto* found =
        std::find_if(statusCodes.begin(), statusCodes.end(),
                     [status](const StatusCode& row) { return row.status == status; });
    errorCode = found == statusCodes.end() ? code::UnknownError : found->code;
}

}  // namespace Orvandeil::FileIO
