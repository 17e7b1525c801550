// SPDX-License-Identifier: MIT
#include "bench/soak/Faults.h"

#include <csignal>
#include <filesystem>
#include <fstream>
#include <random>
#include <thread>

#include <fcntl.h>
#include <sys/wait.h>
#include <unistd.h>

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
                                             "server killed during a call",
                                             "vendor that never ends its answer",
                                             "vendor that forks and crashes",
                                             "no descriptors left",
                                             "second host beside it",
                                             "host killed before",
                                             "foreign repository",
                                             "disk full"};
    return kNames[static_cast<int>(fault)];
}

bool IsServerFault(EFault fault)
{
    return fault == EFault::kServerKilled || fault == EFault::kServerKilledBusy;
}

bool IsHarmless(EFault fault)
{
    return fault != EFault::kAgentKilled && fault != EFault::kAgentKilledBusy && fault != EFault::kAgentStalled &&
           !IsServerFault(fault);
}

void Inject(EFault fault, pid_t process, const std::function<void()>& call)
{
    switch (fault) {
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
    default:
        call();
    }
}

TLoweredLimit::TLoweredLimit(__rlimit_resource resource, rlim_t limit) : fResource(resource)
{
    ::getrlimit(fResource, &fBefore);
    const rlimit lowered = {limit, fBefore.rlim_max};
    ::setrlimit(fResource, &lowered);
}

TLoweredLimit::~TLoweredLimit()
{
    ::setrlimit(fResource, &fBefore);
}

int RunHost(const std::string& root, const std::string& consumer, std::chrono::milliseconds killAfter)
{
    const std::string program = root + "/vrxhost";
    const pid_t host = ::fork();
    if (host == 0) {
        const int nothing = ::open("/dev/null", O_RDWR);
        ::dup2(nothing, STDOUT_FILENO);
        ::dup2(nothing, STDERR_FILENO);
        ::execl(program.c_str(), program.c_str(), "inventory", "--consumer", consumer.c_str(), nullptr);
        ::_exit(127);
    }
    if (killAfter.count() != 0) {
        std::this_thread::sleep_for(killAfter);
        ::kill(host, SIGKILL);
    }
    int status = 0;
    ::waitpid(host, &status, 0);
    return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
}

void LayForeignRepository(const std::string& root)
{
    const std::filesystem::path folder = root + "/pegasus/repository";
    std::filesystem::create_directories(folder / "root#cimv2");
    std::ofstream(folder / "repository.db") << "somebody's own";
    std::filesystem::permissions(folder, std::filesystem::perms::owner_read | std::filesystem::perms::owner_exec);
}

} // namespace soak
