#include "fileio/errors/fi_error.h"

#include "fileio/errors/identifiers.h"
#include "fileio/host/messages.h"

#include <array>
#include <cstring>

namespace Orvandeil::FileIO {
namespace {

struct CodeEntry {
    int code;
    void (*raise)();
    std::u16string (*message)();
};

template <class Id>
void raise() {
    vxErrMsgId(Id());
}

template <class Id>
std::u16string message() {
    return vxMessageText(Id());
}

#define FILEIO_CODE_ENTRY(number, Name) \
    {number, raise<KESTRA::FileIO::Name>, message<KESTRA::FileIO::Name>},
constexpr std::array<CodeEntry, codeCount> codes = {{FILEIO_FOR_EACH_CODE(FILEIO_CODE_ENTRY)}};
#undef FILEIO_CODE_ENTRY

consteval bool inOrder() {
    for (int i = 0; i < codeCount; ++i) {
        if (codes[static_cast<std::size_t>(i)].code != -1 - i) return false;
    }
    return true;
}
static_assert(inOrder(), "a code's place in the list is its number");

// Null for numbers outside the list, which are the system's.
const CodeEntry* findCode(int number) {
    if (number < -codeCount || number > -1) return nullptr;
    return &codes[static_cast<std::size_t>(-1 - number)];
}

KESTRA::FileIO::Errno systemError(int number) {
    char scratch[128];
    // The GNU form: the text is in the scratch or permanent, and never missing.
    return KESTRA::FileIO::Errno(strerror_r(number, scratch, sizeof scratch));
}

}  // namespace

void fiThrowErrMsg(int code) {
    if (const CodeEntry* entry = findCode(code)) entry->raise();
    vxErrMsgId(systemError(code));
}

std::u16string fiPkStrerror(int code) {
    if (code == 0) return {};
    if (const CodeEntry* entry = findCode(code)) return entry->message();
    return vxMessageText(systemError(code));
}

}  // namespace Orvandeil::FileIO
