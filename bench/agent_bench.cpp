// SPDX-License-Identifier: MIT
// The agent's work alone, without sockets and processes: the probe provider enumerates its instances of 17 properties
// through the broker, and each is written as the XML of an answer.
//
//   agent_bench [PASSES]
//
// Prints the processor time of an instance. With PASSES it enumerates so many times and measures nothing: for a
// profiler.
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
std::size_t enumerate(cmpi::ProviderModule& module)
{
    const CIMName className("Probe_Bulk");
    std::size_t size = 0;
    module.writeInstances(cmpi::MofServices::request("Probe"), className, CIMPropertyList(),
                          [&](std::string_view element) { size += element.size(); });
    return size;
}

} // namespace

int main(int argc, char** argv)
{
    cmpi::MofServices services;
    services.compileFile(PROBE_CLASSES);
    cmpi::ProviderModule module("Probe", PROBE_LIBRARY, services);
    if (argc > 1) {
        for (int pass = 0; pass < std::stoi(argv[1]); ++pass) {
            enumerate(module);
        }
        return 0;
    }
    const std::size_t size = enumerate(module); // loads the library and the class
    double best = 1e300;
    for (int round = 0; round < kRounds; ++round) {
        const double start = processorSeconds();
        enumerate(module);
        best = std::min(best, processorSeconds() - start);
    }
    std::printf("%zu bytes each: %.2f us\n", size / kCount, best * 1e6 / kCount);
    return 0;
}
