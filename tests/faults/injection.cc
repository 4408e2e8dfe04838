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

// What is left of a transfer: 0 when it fails, less than all when it is cut short.
std::size_t allowed(Call call, std::size_t size) {
    if (!strikes(call)) return size;
    return state.fault->error != 0 ? 0 : std::min<std::size_t>(size, 1);
}

Disk& diskOf(void* cookie) {
    return *static_cast<Disk*>(cookie);
}

ssize_t readBytes(void* cookie, char* buffer, std::size_t size) {
    Disk& disk = diskOf(cookie);
    const std::size_t count = allowed(Call::Read, size);
    if (count == 0 && size != 0) return -1;
    const std::size_t start = std::min(disk.offset, disk.bytes.size());
    disk.offset = start + disk.bytes.copy(buffer, count, start);
    return static_cast<ssize_t>(disk.offset - start);
}

ssize_t writeBytes(void* cookie, const char* buffer, std::size_t size) {
    Disk& disk = diskOf(cookie);
    const std::size_t count = allowed(Call::Write, size);
    if (disk.appends) disk.offset = disk.bytes.size();
    disk.bytes.resize(std::max(disk.bytes.size(), disk.offset + count));
    disk.bytes.replace(disk.offset, count, buffer, count);
    disk.offset += count;
    return static_cast<ssize_t>(count);
}

int seekTo(void* cookie, off64_t* offset, int whence) {
    Disk& disk = diskOf(cookie);
    if (strikes(Call::Seek)) return -1;
    if (!disk.seekable) {
        errno = ESPIPE;
        return -1;
    }
    const std::size_t origins[] = {0, disk.offset, disk.bytes.size()};
    *offset += static_cast<off64_t>(origins[whence]);
    if (*offset < 0) {
        errno = EINVAL;
        return -1;
    }
    disk.offset = static_cast<std::size_t>(*offset);
    return 0;
}

int closeDisk(void*) {
    return strikes(Call::Close) ? -1 : 0;
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

Disk::Disk(std::string_view content) : bytes(content) {
    bytes.reserve(largestDisk);
    state.newestDisk = this;
}

Disk::~Disk() {
    state.newestDisk = nullptr;
}

// A buffer of a few bytes, so that there are many calls.
std::FILE* Disk::open(const char* mode) {
    appends = mode[0] == 'a';
    if (mode[0] == 'w') bytes.clear();
    std::FILE* const file = fopencookie(this, mode, {readBytes, writeBytes, seekTo, closeDisk});
    std::setvbuf(file, buffer, _IOFBF, sizeof buffer);
    return file;
}

bool Disk::write(std::string_view text) {
    return writeBytes(this, text.data(), text.size()) == static_cast<ssize_t>(text.size());
}

bool Disk::flush() {
    return true;
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
