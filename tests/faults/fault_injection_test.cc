#include "embedded/builtins/code_error.h"
#include "embedded/services/memory.h"
#include "fileio/errors/code_list.h"
#include "fileio/host/exception.h"
#include "tests/faults/scenarios.h"

#include <algorithm>
#include <cerrno>
#include <cstdint>
#include <cstdio>
#include <new>
#include <set>

#include <gtest/gtest.h>

namespace faults {
namespace {

using embedded::liveBlockCount;

constexpr int shortened = 0;
constexpr Fault faultTable[] = {
    {Call::HostMemory, 0, false, "host allocation"},
    {Call::HostMemory, 0, true, "host allocations"},
    {Call::Memory, 0, false, "allocation"},
    {Call::Memory, 0, true, "allocations"},
    {Call::Read, EIO, false, "read EIO"},
    {Call::Read, EIO, true, "reads EIO"},
    {Call::Read, EINTR, false, "read EINTR"},
    {Call::Read, shortened, false, "read shortened"},
    {Call::Read, shortened, true, "reads shortened"},
    {Call::Write, ENOSPC, false, "write ENOSPC"},
    {Call::Write, ENOSPC, true, "writes ENOSPC"},
    {Call::Write, EINTR, false, "write EINTR"},
    {Call::Write, shortened, false, "write shortened"},
    {Call::Seek, EIO, false, "seek EIO"},
    {Call::Seek, EIO, true, "seeks EIO"},
    {Call::Stat, EIO, false, "fstat EIO"},
    {Call::Stat, EIO, true, "fstats EIO"},
    {Call::Close, EIO, false, "close EIO"},
};

constexpr int hostExhausted = -1000;
constexpr int otherError = -2000;

struct Outcome {
    World world;
    int code = 0;
    std::string error;
    std::string bytes;  // on the disk when the scenario ended
    bool faultHappened = false;
};

// The code of what a scenario ends with.
int codeOfRun(const Scenario& scenario, Outcome& outcome) {
    try {
        scenario.run(outcome.world);
    } catch (const embedded::CodeError& error) {
        return error.code;
    } catch (const foundation::core::except::IMsgIDException& error) {
        const Pause pause;
        outcome.error = error.GetID();
        return outcome.error == "KESTRA:nomem" ? hostExhausted : otherError;
    } catch (const std::bad_alloc&) {
        return hostExhausted;
    } catch (const std::exception& error) {
        const Pause pause;
        outcome.error = error.what();
        return otherError;
    }
    return 0;
}

void run(const Scenario& scenario, const Fault& fault, std::size_t nth, Outcome& outcome) {
    {
        const Injection injection(fault, nth);
        outcome.code = codeOfRun(scenario, outcome);
    }
    outcome.faultHappened = Injection::happened();
    if (outcome.world.disk) outcome.bytes = outcome.world.disk->bytes;
}

// The codes that stand for a fault: the system's own, or what the library makes of it.
bool isDocumented(const Fault& fault, int code) {
    namespace c = Orvandeil::FileIO::code;
    switch (fault.call) {
        case Call::HostMemory:
        case Call::Memory:
            return code == hostExhausted || code == c::NoMemory;
        case Call::Read:
            return code == fault.error || code == c::ReadFailed || code == c::NoHelp ||
                   code == c::FseekFailedSkip || code == c::WriteCarryByteFailed;
        default:
            return code == fault.error || code == c::NoHelp || code == c::FlushError ||
                   code == c::WriteCarryByteFailed || code == c::FseekFailed ||
                   code == c::FseekFailedSkip;
    }
}

bool isSubsequence(std::string_view part, std::string_view whole) {
    auto from = whole.begin();
    for (const char byte : part) {
        from = std::find(from, whole.end(), byte);
        if (from++ == whole.end()) return false;
    }
    return true;
}

// Every byte is the one before the call or the one behind it. A console goes on behind a write that
// failed.
bool isIntact(const Outcome& outcome, const Outcome& reference) {
    const std::string& initial = outcome.world.initial;
    const std::string& bytes = outcome.bytes;
    if (outcome.world.isConsole) return isSubsequence(bytes, reference.bytes);
    if (bytes.size() > std::max(initial.size(), reference.bytes.size())) return false;
    for (std::size_t i = 0; i < bytes.size(); ++i) {
        const bool isOld = i < initial.size() && bytes[i] == initial[i];
        const bool isNew = i < reference.bytes.size() && bytes[i] == reference.bytes[i];
        if (!isOld && !isNew) return false;
    }
    return true;
}

void compare(const Scenario& scenario, const Fault& fault, Outcome& outcome,
             const Outcome& reference) {
    if (outcome.code != 0) {
        EXPECT_TRUE(isDocumented(fault, outcome.code)) << outcome.code << ' ' << outcome.error;
    } else if (!scenario.mayFallBack) {
        EXPECT_EQ(outcome.world.values, reference.world.values);
        EXPECT_EQ(outcome.bytes, reference.bytes);
    }
    EXPECT_TRUE(isIntact(outcome, reference))
        << '"' << outcome.bytes << "\" and not \"" << reference.bytes;
    EXPECT_EQ(outcome.world.nextCall(), "");
}

struct Attempt {
    bool faultHappened;
    bool leaked;
};

Attempt attempt(const Scenario& scenario, const Fault& fault, std::size_t nth,
                const Outcome& reference) {
    const std::size_t blocks = liveBlockCount();
    const std::size_t objects = liveObjectCount();
    bool faultHappened = false;
    {
        Outcome outcome;
        run(scenario, fault, nth, outcome);
        compare(scenario, fault, outcome, reference);
        faultHappened = outcome.faultHappened;
    }
    return {faultHappened, liveBlockCount() != blocks || liveObjectCount() != objects};
}

// The faults injected.
std::size_t runWithFault(const Scenario& scenario, const Fault& fault, const Outcome& reference) {
    for (std::size_t nth = 1;; ++nth) {
        SCOPED_TRACE(scenario.name + ", " + fault.name + ' ' + std::to_string(nth));
        const Attempt first = attempt(scenario, fault, nth, reference);
        // What the first failure in a process makes stays.
        EXPECT_FALSE(first.leaked && attempt(scenario, fault, nth, reference).leaked);
        if (!first.faultHappened) return nth - 1;
        if (testing::Test::HasFailure()) return nth;
    }
}

// The faults injected.
std::size_t runWithFaults(const Scenario& scenario) {
    constexpr Fault none = {Call::Close, 0, false, "nothing"};
    constexpr std::size_t never = SIZE_MAX;
    {
        // Makes what is made once in a process.
        Outcome first;
        run(scenario, none, never, first);
    }
    Outcome reference;
    run(scenario, none, never, reference);
    EXPECT_EQ(reference.code, 0) << scenario.name << ' ' << reference.error;
    EXPECT_EQ(reference.world.nextCall(), "") << scenario.name;
    std::size_t injected = 0;
    for (const Fault& fault : faultTable)
        injected += runWithFault(scenario, fault, reference);
    return injected;
}

TEST(FaultInjection, EveryScenarioSurvivesEveryFault) {
    const std::vector<Scenario> scenarios = everyScenario();
    std::size_t injected = 0;
    for (const Scenario& scenario : scenarios)
        injected += runWithFaults(scenario);
    EXPECT_GE(scenarios.size(), 60u);
    std::printf("%zu scenarios, %zu faults\n", scenarios.size(), injected);
    RecordProperty("scenarios", static_cast<int>(scenarios.size()));
    RecordProperty("faults", static_cast<int>(injected));
}

}  // namespace
}  // namespace faults
