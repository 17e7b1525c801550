// SPDX-License-Identifier: MIT
// The agent's work alone, without sockets and processes: the probe provider enumerates its instances of 17 properties
// through the broker, and each is written as the XML of an answer.
//
//   agent_bench [CLASS [PASSES]]
//
// Prints a line for each class: all 17 properties set, 2 of them set and 15 null, and the 2 alone. With PASSES it
// enumerates so many times and measures nothing: for a profiler.
#include "pegasus/cmpi/module/ProviderModule.h"
#include "tests/pegasus/cmpi/MofServices.h"

#include <algorithm>
#include <cstdio>
#include <ctime>
#include <string>

using namespace Pegasus;

namespace {

constexpr int kRounds = 25;
constexpr unsigned kCount = 1000; // the probe's own number of instances

double processorSeconds()
{
    timespec now{};
    ::clock_gettime(CLOCK_THREAD_CPUTIME_ID, &now);
    return double(now.tv_sec) + double(now.tv_nsec) * 1e-9;
}

// Returns: the bytes of the answer.
std::size_t enumerate(cmpi::ProviderModule& module, const char* className)
{
    std::size_t size = 0;
    module.writeInstances(cmpi::MofServices::request("Probe"), CIMName(className), CIMPropertyList(),
                          [&](std::string_view element) { size += element.size(); });
    return size;
}

void measure(cmpi::ProviderModule& module, const char* className)
{
    const std::size_t size = enumerate(module, className); // loads the library and the class
    double best = 1e300;
    for (int round = 0; round < kRounds; ++round) {
        const double start = processorSeconds();
        enumerate(module, className);
        best = std::min(best, processorSeconds() - start);
    }
    std::printf("%-12s %5zu bytes each: %6.2f us, %.2f ns a byte\n", className, size / kCount, best * 1e6 / kCount,
                best * 1e9 / double(size));
}

} // namespace

int main(int argc, char** argv)
{
    cmpi::MofServices services;
    services.compileFile(PROBE_CLASSES);
    cmpi::ProviderModule module("Probe", PROBE_LIBRARY, services);
    for (const char* const className : {"Probe_Bulk", "Probe_Sparse", "Probe_Short"}) {
        if (argc > 1 && className != std::string(argv[1])) {
            continue;
        }
        if (argc > 2) {
            for (int pass = 0; pass < std::stoi(argv[2]); ++pass) {
                enumerate(module, className);
            }
        } else {
            measure(module, className);
        }
    }
    return 0;
}
