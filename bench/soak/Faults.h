#pragma once

#include <chrono>
#include <functional>

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
    kServerKilledBusy
};
constexpr EFault kFaults[] = {
    EFault::kNone,         EFault::kAgentKilled,     EFault::kAgentSlow,       EFault::kServerKilled,
    EFault::kAgentStalled, EFault::kAgentKilledBusy, EFault::kServerKilledBusy};

const char* NameOf(EFault fault);
bool IsServerFault(EFault fault);
// Returns: whether the call that the fault hits must still give the whole answer.
bool IsHarmless(EFault fault);

// Hits the process (the agent, or the server for a server's fault) while the call runs or just before it.
// Blocks: until both have ended.
void Inject(EFault fault, pid_t process, const std::function<void()>& call);

} // namespace soak
