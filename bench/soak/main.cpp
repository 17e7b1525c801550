// SPDX-License-Identifier: MIT
// One long-lived host that opens, uses and clears the namespace of a staged tree again and again while processes of the
// tree are killed and stopped. Prints a table of counts; the exit status is 0 when every answer was right and nothing
// leaked. tools/soak stages the tree and runs it.
// Usage: soak_host ROOT CONSUMER MINUTES
#include "bench/soak/Faults.h"
#include "bench/soak/Inventory.h"
#include "bench/soak/Resources.h"
#include "host/cli/TPrivateServer.h"
#include "host/cli/TSession.h"
#include "host/cli/model/ErrorReport.h"
#include "host/core/TProcessLog.h"

#include <host/TConfig.h>
#include <host/TRootObject.h>

#include <algorithm>
#include <atomic>
#include <chrono>
#include <csignal>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <map>
#include <random>
#include <thread>

#include <unistd.h>

namespace soak {
namespace {

using namespace std::chrono_literals;
using TClock = std::chrono::steady_clock;
using NKOLVRX20::TConfig;
using NKOLVRX20::TRootObject;

constexpr int kRounds = 10;                // of all operations, before and after the fault
constexpr unsigned int kHungSeconds = 600; // a cycle takes a quarter of a minute
constexpr auto kRecovery = 20s;
constexpr int kWarmCycles = 2; // after these, everything that is allocated once has been
// The allocator's own caches come and go; a leak of one object a cycle shows against this after some hours.
constexpr long kHeapNoiseBytes = 256 << 10;

class TQuietLog : public NKOLVRX20::ILogger
{
  public:
    void Log(EVRXLogSeverity, const std::string&) override {}
};

struct TCounts
{
    long fCycles = 0;
    std::map<std::string, long> fOperations;
    std::map<std::string, long> fFaults;
    long fWrong = 0;
    long fLost = 0; // whole or in part, by a fault
    long fProcesses = 0;
    long fFiles = 0;
    double fLongestSeconds = 0;
};

class TSoak
{
  public:
    TSoak(std::string root, std::string consumer) : fRoot(std::move(root)), fConsumer(std::move(consumer)) {}

    void Run(std::chrono::minutes duration);
    bool IsClean() const;
    void Print() const;

  private:
    void Cycle(EFault fault);
    void UseNamespace(NKOLVRX20::ICIMNamespace& ns, EFault fault);
    void Suffer(TInventory& inventory, EFault fault, pid_t process);
    void SufferBefore(EFault fault);
    void Recover(TInventory& inventory);
    void Rounds(TInventory& inventory, bool healthy);
    void Note(const char* operation, bool healthy, EAnswer (TInventory::*ask)(), TInventory& inventory);
    template <typename TCall> void Do(const char* operation, bool healthy, const TCall& call);
    void CheckLeftovers();

    std::string fRoot;
    std::string fConsumer;
    TCounts fCounts;
    TResources fWarm{};
    TResources fLast{};
    TClock::time_point fStart = TClock::now();
    std::mt19937 fRandom{1};
    std::atomic<bool> fSecondFailed{false};
};

// Times and counts one operation. While the tree is healthy, less than the whole answer is a wrong one.
template <typename TCall> void TSoak::Do(const char* operation, bool healthy, const TCall& call)
{
    const auto start = TClock::now();
    const EAnswer answer = call();
    const std::chrono::duration<double> took = TClock::now() - start;
    fCounts.fLongestSeconds = std::max(fCounts.fLongestSeconds, took.count());
    ++fCounts.fOperations[operation];
    if (answer == EAnswer::kWrong || (answer == EAnswer::kLess && healthy)) {
        ++fCounts.fWrong;
        std::fprintf(stderr, "soak: cycle %ld: %s: %s answer\n", fCounts.fCycles, operation,
                     answer == EAnswer::kWrong ? "a wrong" : "no whole");
    } else if (answer == EAnswer::kLess) {
        ++fCounts.fLost;
    }
}

void TSoak::Note(const char* operation, bool healthy, EAnswer (TInventory::*ask)(), TInventory& inventory)
{
    Do(operation, healthy, [&] { return (inventory.*ask)(); });
}

void TSoak::Rounds(TInventory& inventory, bool healthy)
{
    for (int i = 0; i < kRounds; ++i) {
        Note("enumerate 1,000 instances", healthy, &TInventory::EnumerateProbe, inventory);
        Do("invoke", healthy, [&] { return inventory.InvokeEcho("text " + std::to_string(i)); });
        Note("enumerate processors", healthy, &TInventory::EnumerateProcessors, inventory);
    }
}

// After an agent's fault, calls may fail for a moment; then everything must be as before.
void TSoak::Recover(TInventory& inventory)
{
    const auto deadline = TClock::now() + kRecovery;
    EAnswer answer = EAnswer::kLess;
    while (answer == EAnswer::kLess && TClock::now() < deadline) {
        Do("enumerate 1,000 instances", false, [&] { return answer = inventory.EnumerateProbe(); });
    }
    Rounds(inventory, true);
}

void TSoak::UseNamespace(NKOLVRX20::ICIMNamespace& ns, EFault fault)
{
    TInventory inventory(ns);
    Rounds(inventory, true);
    const pid_t process = IsServerFault(fault) ? ServerProcess(fRoot, fConsumer) : inventory.ProbeProcess();
    if (process <= 1) {
        ++fCounts.fWrong;
        std::fprintf(stderr, "soak: cycle %ld: no process to do \"%s\" to\n", fCounts.fCycles, NameOf(fault));
        return;
    }
    Suffer(inventory, fault, process);
    ++fCounts.fFaults[NameOf(fault)];
    if (IsServerFault(fault)) {
        Rounds(inventory, false);
    } else {
        Recover(inventory);
    }
}

void TSoak::Suffer(TInventory& inventory, EFault fault, pid_t process)
{
    switch (fault) {
    case EFault::kEndlessVendor:
        Note("enumerate without end", true, &TInventory::EnumerateEndless, inventory);
        return;
    case EFault::kForkingVendor:
        Note("fork and crash", true, &TInventory::ForkAndCrash, inventory);
        return;
    case EFault::kNoDescriptors: {
        const TLoweredLimit limit(RLIMIT_NOFILE, 3);
        Note("enumerate 1,000 instances", false, &TInventory::EnumerateProbe, inventory);
        return;
    }
    case EFault::kSecondHost: {
        std::thread other([this] {
            const int status = RunHost(fRoot + "-second", fConsumer + "-second", 0ms);
            if (status != 0) {
                std::fprintf(stderr, "soak: the second host ended with status %d\n", status);
                fSecondFailed = true;
            }
        });
        Rounds(inventory, true);
        other.join();
        fCounts.fWrong += fSecondFailed.exchange(false) ? 1 : 0;
        return;
    }
    default:
        Inject(fault, process,
               [&] { Note("enumerate 1,000 instances", IsHarmless(fault), &TInventory::EnumerateProbe, inventory); });
    }
}

// What happens to the tree while no namespace is open; the next start must overcome it.
void TSoak::SufferBefore(EFault fault)
{
    constexpr int kHostsLifeMs = 8000;
    constexpr rlim_t kFullDiskBytes = 16 << 10;
    if (fault == EFault::kHostKilled) {
        RunHost(fRoot, fConsumer, std::chrono::milliseconds(std::uniform_int_distribution<>(1, kHostsLifeMs)(fRandom)));
    } else if (fault == EFault::kForeignRepository) {
        LayForeignRepository(fRoot);
    } else if (fault == EFault::kFullDisk) {
        std::signal(SIGXFSZ, SIG_IGN); // a write fails then, here and in the programs that are run
        const TLoweredLimit limit(RLIMIT_FSIZE, kFullDiskBytes);
        const std::string error = vrxhost::ErrorOf([&] {
            vrxhost::TSession session(fRoot + "/libpegasus.nsp.so", fConsumer);
            session.Open();
            session.Close();
        });
        fCounts.fLost += error.empty() ? 0 : 1;
    }
}

void TSoak::Cycle(EFault fault)
{
    ::alarm(kHungSeconds);
    TConfig::GetInstance()->setValue("pegasus_multi_thread", fCounts.fCycles % 2 == 0 ? "off" : "on");
    SufferBefore(fault);
    const std::string error = vrxhost::ErrorOf([&] {
        vrxhost::TSession session(fRoot + "/libpegasus.nsp.so", fConsumer);
        session.Open();
        UseNamespace(session.GetNamespace(), fault);
        const std::string problem = session.Close();
        if (!problem.empty()) {
            throw vrxhost::TPluginError(problem);
        }
    });
    ++fCounts.fOperations["start and clear"];
    if (!error.empty()) {
        ++fCounts.fWrong;
        std::fprintf(stderr, "soak: cycle %ld: %s\n", fCounts.fCycles, error.c_str());
    }
    CheckLeftovers();
    ++fCounts.fCycles;
    ::alarm(0);
}

// Agents get a moment to notice that their server has gone.
void TSoak::CheckLeftovers()
{
    const auto deadline = TClock::now() + 5s;
    while (!ProcessesOf(fRoot).empty() && TClock::now() < deadline) {
        std::this_thread::sleep_for(50ms);
    }
    for (const pid_t process : ProcessesOf(fRoot)) {
        if (process == ::getpid()) {
            continue;
        }
        ++fCounts.fProcesses;
        std::fprintf(stderr, "soak: cycle %ld: process %d is left\n", fCounts.fCycles, process);
    }
    for (const std::string& path : {StartFile(fConsumer), fRoot + "/pegasus/repository"}) {
        fCounts.fFiles += std::filesystem::exists(path) ? 1 : 0;
    }
    NKOLVRX20::TProcessLog::Instance().Take(); // the host remembers failed programs until it is asked
    fLast = TakeResources();
    if (fCounts.fCycles < kWarmCycles) {
        fWarm = fLast;
    }
    std::fprintf(stderr, "soak: %ld s, cycle %ld, %ld wrong, %zu descriptors, heap %zu bytes, resident %zu kB\n",
                 static_cast<long>(std::chrono::duration_cast<std::chrono::seconds>(TClock::now() - fStart).count()),
                 fCounts.fCycles, fCounts.fWrong, fLast.fDescriptors, fLast.fHeapBytes, fLast.fResidentBytes >> 10);
}

void TSoak::Run(std::chrono::minutes duration)
{
    TQuietLog log;
    TRootObject::SetCoreLogger(&log);
    const std::string error = vrxhost::TPrivateServer(fRoot, fConsumer).SetConsumer();
    if (!error.empty()) {
        std::fprintf(stderr, "soak: the consumer's name could not be set: %s\n", error.c_str());
        std::exit(2);
    }
    while (TClock::now() - fStart < duration) {
        Cycle(kFaults[static_cast<std::size_t>(fCounts.fCycles) % std::size(kFaults)]);
    }
    TRootObject::SetCoreLogger(nullptr);
}

bool TSoak::IsClean() const
{
    return fCounts.fWrong == 0 && fCounts.fProcesses == 0 && fCounts.fFiles == 0 &&
           fLast.fDescriptors <= fWarm.fDescriptors &&
           static_cast<long>(fLast.fHeapBytes) - static_cast<long>(fWarm.fHeapBytes) < kHeapNoiseBytes;
}

void TSoak::Print() const
{
    const auto row = [](const std::string& what, long count) { std::printf("| %s | %ld |\n", what.c_str(), count); };
    const std::chrono::duration<double> took = TClock::now() - fStart;
    std::printf("| what | count |\n|---|---|\n");
    row("seconds", static_cast<long>(took.count()));
    for (const auto& [name, count] : fCounts.fOperations) {
        row("operations: " + name, count);
    }
    for (const auto& [name, count] : fCounts.fFaults) {
        row("faults: " + name, count);
    }
    row("answers lost to a fault, whole or in part", fCounts.fLost);
    row("longest operation, ms", static_cast<long>(fCounts.fLongestSeconds * 1000));
    row("wrong answers", fCounts.fWrong);
    row("leaked processes", fCounts.fProcesses);
    row("leaked start files and repositories", fCounts.fFiles);
    row("leaked descriptors", static_cast<long>(fLast.fDescriptors) - static_cast<long>(fWarm.fDescriptors));
    row("heap bytes in use, last cycle less the second",
        static_cast<long>(fLast.fHeapBytes) - static_cast<long>(fWarm.fHeapBytes));
    row("resident kB, last cycle less the second",
        (static_cast<long>(fLast.fResidentBytes) - static_cast<long>(fWarm.fResidentBytes)) / 1024);
}

} // namespace
} // namespace soak

int main(int argc, char** argv)
{
    const int minutes = argc == 4 ? std::atoi(argv[3]) : 0;
    if (minutes <= 0 || argv[1][0] != '/' || ::chdir(argv[1]) != 0) {
        std::fprintf(stderr, "usage: soak_host ROOT CONSUMER MINUTES (ROOT absolute, a staged tree)\n");
        return 2;
    }
    soak::TSoak soak(argv[1], argv[2]);
    soak.Run(std::chrono::minutes(minutes));
    soak.Print();
    return soak.IsClean() ? 0 : 1;
}
