#include "tests/faults/injection.h"

#include "embedded/services/memory.h"

#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <fcntl.h>
#include <new>
#include <optional>

#include <sys/stat.h>

namespace faults {
namespace {

using Orvandeil::FileIO::embedded::FailingAllocation;

constexpr std::size_t largestDisk = 1 << 20;

struct State {
    const Fault* fault = nullptr;
    std::size_t callsLeft = 0;  // up to and including the one that fails
    bool happened = false;
    int pauses = 0;
    std::size_t liveObjects = 0;
    const Disk* newestDisk = nullptr;
};
State state;
std::optional<FailingAllocation> hostFault;

// Whether this call is to fail, errno being set then.
bool strikes(Call call) {
    if (state.fault == nullptr || state.pauses != 0 || state.fault->call != call) return false;
    if (state.callsLeft > 1) {
        --state.callsLeft;
        return false;
    }
    if (state.happened && !state.fault->onwards) return false;
    state.happened = true;
    errno = state.fault->error;
    return true;
}

std::size_t allowed(const support::FaultyFile& file, Call call, std::size_t count) {
    const bool isStruck = strikes(call);
    const bool isPipe = call == Call::Seek && !static_cast<const Disk&>(file).seekable;
    if (isPipe && !isStruck) errno = ESPIPE;
    if (!isStruck) return isPipe ? 0 : count;
    return state.fault->error != 0 ? 0 : std::min<std::size_t>(count, 1);
}

void* allocate(std::size_t bytes) noexcept {
    void* const block =
        strikes(Call::Memory) ? nullptr : std::malloc(std::max<std::size_t>(bytes, 1));
    if (block != nullptr) ++state.liveObjects;
    return block;
}

}  // namespace

Injection::Injection(const Fault& fault, std::size_t nth) {
    state.happened = false;
    state.callsLeft = nth;
    state.fault = &fault;
    if (fault.call != Call::HostMemory) return;
    hostFault.emplace(nth, fault.onwards ? FailingAllocation::Onwards : FailingAllocation::Once);
}

Injection::~Injection() {
    state.fault = nullptr;
    if (hostFault) state.happened = hostFault->happened();
    hostFault.reset();
}

bool Injection::happened() {
    return state.happened;
}

Pause::Pause() {
    ++state.pauses;
}
Pause::~Pause() {
    --state.pauses;
}

std::size_t liveObjectCount() {
    return state.liveObjects;
}

Disk::Disk(std::string_view content) {
    bytes = content;
    bytes.reserve(largestDisk);
    allow = allowed;
    state.newestDisk = this;
}

Disk::~Disk() {
    state.newestDisk = nullptr;
}

// A buffer of a few bytes, so that there are many calls.
std::FILE* Disk::open(const char* mode) {
    const Pause pause;
    appends = mode[0] == 'a';
    if (mode[0] == 'w') bytes.clear();
    return FaultyFile::open(mode, 16);
}

}  // namespace faults

void* operator new(std::size_t bytes) {
    if (void* const block = faults::allocate(bytes)) return block;
    throw std::bad_alloc();
}
void* operator new(std::size_t bytes, const std::nothrow_t&) noexcept {
    return faults::allocate(bytes);
}
// Not inlined, where compilers would take the C library's functions for a mismatch.
[[gnu::noinline]] void operator delete(void* block) noexcept {
    if (block != nullptr) --faults::state.liveObjects;
    std::free(block);
}
[[gnu::noinline]] void operator delete(void* block, std::size_t) noexcept {
    operator delete(block);
}

extern "C" int fstat(int descriptor, struct stat* status) noexcept {
    using namespace faults;
    if (strikes(Call::Stat)) return -1;
    if (descriptor >= 0 || state.newestDisk == nullptr) {
        return fstatat(descriptor, "", status, AT_EMPTY_PATH);
    }
    *status = {};
    status->st_mode = S_IFREG;
    status->st_size = static_cast<off_t>(state.newestDisk->bytes.size());
    return 0;
}
