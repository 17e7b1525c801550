#include "bench/soak/Faults.h"

#include <csignal>
#include <random>
#include <thread>

namespace soak {
namespace {

using namespace std::chrono_literals;

// The class's timeout is 5 s (tools/soak writes it into the vendor's class list).
constexpr auto kSlow = 1500ms;
constexpr auto kStall = 7s;
constexpr int kLongestDelayMs = 60; // an enumeration of the probe takes about as long

void KillDuring(pid_t process, const std::function<void()>& call)
{
    static std::mt19937 fgRandom(1);
    const std::chrono::milliseconds delay(std::uniform_int_distribution<>(0, kLongestDelayMs)(fgRandom));
    std::thread killer([=] {
        std::this_thread::sleep_for(delay);
        ::kill(process, SIGKILL);
    });
    call();
    killer.join();
}

void StandStillDuring(pid_t process, std::chrono::milliseconds duration, const std::function<void()>& call)
{
    ::kill(process, SIGSTOP);
    std::thread waker([=] {
        std::this_thread::sleep_for(duration);
        ::kill(process, SIGCONT);
    });
    call();
    waker.join();
}

} // namespace

const char* NameOf(EFault fault)
{
    static constexpr const char* kNames[] = {"none",
                                             "agent killed between calls",
                                             "agent killed during a call",
                                             "agent slow, within the timeout",
                                             "agent slow, beyond the timeout",
                                             "server killed between calls",
                                             "server killed during a call"};
    return kNames[static_cast<int>(fault)];
}

bool IsServerFault(EFault fault)
{
    return fault == EFault::kServerKilled || fault == EFault::kServerKilledBusy;
}

bool IsHarmless(EFault fault)
{
    return fault == EFault::kNone || fault == EFault::kAgentSlow;
}

void Inject(EFault fault, pid_t process, const std::function<void()>& call)
{
    switch (fault) {
    case EFault::kNone:
        call();
        break;
    case EFault::kAgentKilled:
    case EFault::kServerKilled:
        ::kill(process, SIGKILL);
        call();
        break;
    case EFault::kAgentKilledBusy:
    case EFault::kServerKilledBusy:
        KillDuring(process, call);
        break;
    case EFault::kAgentSlow:
        StandStillDuring(process, kSlow, call);
        break;
    case EFault::kAgentStalled:
        StandStillDuring(process, kStall, call);
        break;
    }
}

} // namespace soak
