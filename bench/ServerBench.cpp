// SPDX-License-Identifier: MIT
// What a start of the private server and a new connection to it cost. cim_bench measures the operations.
#include "tests/pegasus/server/HttpExchange.h"
#include "tests/pegasus/server/ServerTree.h"

#include <Pegasus/Client/CIMClient.h>

#include <benchmark/benchmark.h>

#include <algorithm>
#include <chrono>
#include <memory>
#include <vector>

using namespace Pegasus;

namespace {

const CIMNamespaceName kNamespace("root/probe");

// One server with the probe provider, shared by all benchmarks except launch.
class TProbeServer
{
  public:
    TProbeServer()
    {
        fTree.start();
        fTree.installProbe();
    }

    static TProbeServer& get()
    {
        static TProbeServer fgServer;
        return fgServer;
    }

    const servertest::ServerTree& tree() const { return fTree; }

  private:
    servertest::ServerTree fTree;
};

// Runs operations and shows their median: an operation whose threads wait for a busy processor takes many times as
// long.
template <typename Operation> void runWithMedian(benchmark::State& state, const Operation& operation)
{
    using Clock = std::chrono::steady_clock;
    std::vector<Clock::duration> times;
    for (auto _ : state) {
        const Clock::time_point start = Clock::now();
        operation();
        times.push_back(Clock::now() - start);
    }
    const auto middle = times.begin() + static_cast<std::ptrdiff_t>(times.size() / 2);
    std::nth_element(times.begin(), middle, times.end());
    state.counters["median_us"] = std::chrono::duration<double, std::micro>(*middle).count();
    state.SetItemsProcessed(state.iterations());
}

// One operation on a connection of its own: both sides ask the kernel who the other one is.
void getClassOnNewConnections(benchmark::State& state)
{
    const TProbeServer& server = TProbeServer::get();
    runWithMedian(state, [&] {
        CIMClient client;
        client.connect("127.0.0.1", server.tree().port(), String(), String());
        benchmark::DoNotOptimize(client.getClass(kNamespace, "Probe_Bulk", false));
    });
}

// The same without this library's client, which leaves the server's question alone.
void requestsOnNewConnections(benchmark::State& state)
{
    const TProbeServer& server = TProbeServer::get();
    const std::string request =
        servertest::intrinsicRequest("GetClass", "root/probe",
                                     servertest::classNameParameter("Probe_Bulk") +
                                         "<IPARAMVALUE NAME=\"LocalOnly\"><VALUE>FALSE</VALUE></IPARAMVALUE>");
    runWithMedian(state, [&] {
        if (servertest::exchange(server.tree().port(), request).status != 200) {
            state.SkipWithError("no answer");
        }
    });
}

// From the start of the process until its launcher has returned, on an empty repository. A connection, outside the
// time, shows that it listens then.
void launch(benchmark::State& state)
{
    for (auto _ : state) {
        state.PauseTiming();
        auto tree = std::make_unique<servertest::ServerTree>();
        state.ResumeTiming();
        tree->start();
        state.PauseTiming();
        servertest::RawConnection connection(tree->port());
        tree.reset();
        state.ResumeTiming();
    }
}

BENCHMARK(getClassOnNewConnections)->UseRealTime();
BENCHMARK(requestsOnNewConnections)->UseRealTime();
BENCHMARK(launch)
    ->Unit(benchmark::kMillisecond)
    ->UseRealTime()
    ->Iterations(1)
    ->Repetitions(21)
    ->ReportAggregatesOnly(true);

} // namespace

BENCHMARK_MAIN();
