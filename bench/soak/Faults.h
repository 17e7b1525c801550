// SPDX-License-Identifier: MIT
#pragma once

#include <chrono>
#include <functional>
#include <string>

#include <sys/resource.h>
#include <sys/types.h>

namespace soak {

// What is done to a process of the tree, and when.
enum class EFault
{
    kNone,
    kAgentKilled,     // between two calls
    kAgentKilledBusy, // during an enumeration
    kAgentSlow,       // stands still for a while, within the class's timeout
    kAgentStalled,    // stands still for longer than that
    kServerKilled,
    kServerKilledBusy,
    kEndlessVendor,     // a class whose provider never ends its answer
    kForkingVendor,     // a method that forks and crashes
    kNoDescriptors,     // the host can open nothing more
    kSecondHost,        // a host of another tree runs from start to end
    kHostKilled,        // before the start: a host of the tree, at any moment of its life
    kForeignRepository, // before the start: something else is in the repository's place
    kFullDisk           // before the start: an attempt whose programs cannot write
};
constexpr EFault kFaults[] = {EFault::kNone,
                              EFault::kAgentKilled,
                              EFault::kAgentSlow,
                              EFault::kServerKilled,
                              EFault::kEndlessVendor,
                              EFault::kHostKilled,
                              EFault::kSecondHost,
                              EFault::kNoDescriptors,
                              EFault::kAgentStalled,
                              EFault::kForkingVendor,
                              EFault::kForeignRepository,
                              EFault::kFullDisk,
                              EFault::kAgentKilledBusy,
                              EFault::kServerKilledBusy};

const char* NameOf(EFault fault);
bool IsServerFault(EFault fault);
// Returns: whether the call that the fault hits must still give the whole answer.
bool IsHarmless(EFault fault);

// Hits the process (the agent, or the server for a server's fault) while the call runs or just before it.
// Requires: a fault that is a signal, or kNone.
// Blocks: until both have ended.
void Inject(EFault fault, pid_t process, const std::function<void()>& call);

// Lowers a limit of this process and of those that it starts for a lifetime.
class TLoweredLimit
{
  public:
    TLoweredLimit(__rlimit_resource resource, rlim_t limit);
    ~TLoweredLimit();
    TLoweredLimit(const TLoweredLimit&) = delete;
    TLoweredLimit& operator=(const TLoweredLimit&) = delete;

  private:
    const __rlimit_resource fResource;
    rlimit fBefore{};
};

// Runs vrxhost of a tree, and kills it after the time; zero lets it end. Returns: its exit status; -1 when it was
// killed.
int RunHost(const std::string& root, const std::string& consumer, std::chrono::milliseconds killAfter);
// Puts a folder with foreign content in the place of the tree's repository.
void LayForeignRepository(const std::string& root);

} // namespace soak
