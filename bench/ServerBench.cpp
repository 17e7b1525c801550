// SPDX-License-Identifier: MIT
// The private server as its users meet it: whole programs, an agent and the client library over the loopback interface.
// bareExpat is the reference loop: a bare expat pass over the same bytes in the same run.
#include "tests/pegasus/server/HttpExchange.h"
#include "tests/pegasus/server/ServerTree.h"

#include <Pegasus/Client/CIMClient.h>

#include <benchmark/benchmark.h>
#include <expat.h>

#include <algorithm>
#include <chrono>
#include <filesystem>
#include <fstream>
#include <memory>
#include <sstream>
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
        fClient.setTimeout(600'000);
        fClient.connect("127.0.0.1", fTree.port(), String(), String());
    }

    static TProbeServer& get()
    {
        static TProbeServer fgServer;
        return fgServer;
    }

    CIMClient& client() { return fClient; }
    const servertest::ServerTree& tree() const { return fTree; }

    void setCount(Uint32 count)
    {
        Array<CIMParamValue> in;
        Array<CIMParamValue> out;
        in.append(CIMParamValue("Count", CIMValue(count)));
        fClient.invokeMethod(kNamespace, CIMObjectPath("Probe_Bulk"), "SetCount", in, out);
    }

    // The XML of one enumeration, without its framing.
    std::string enumerationBytes() const
    {
        servertest::RawConnection connection(fTree.port());
        connection.send(servertest::intrinsicRequest("EnumerateInstances", "root/probe",
                                                     servertest::classNameParameter("Probe_Bulk")));
        return connection.receive(std::chrono::minutes(5)).body;
    }

  private:
    servertest::ServerTree fTree;
    CIMClient fClient;
};

// Peak resident memory of a process, in MB.
double peakMegabytes(int pid)
{
    std::ifstream status("/proc/" + std::to_string(pid) + "/status");
    for (std::string line; std::getline(status, line);) {
        if (line.rfind("VmHWM:", 0) == 0) {
            return std::stod(line.substr(6)) / 1024;
        }
    }
    return 0;
}

void enumerateInstances(benchmark::State& state)
{
    TProbeServer& server = TProbeServer::get();
    server.setCount(static_cast<Uint32>(state.range(0)));
    const std::size_t bytes = server.enumerationBytes().size();
    for (auto _ : state) {
        if (server.client().enumerateInstances(kNamespace, "Probe_Bulk").size() != state.range(0)) {
            state.SkipWithError("instances are missing");
        }
    }
    state.SetBytesProcessed(static_cast<std::int64_t>(bytes) * state.iterations());
    state.SetItemsProcessed(state.range(0) * state.iterations());
    const int process = server.tree().serverProcess();
    state.counters["server_MB"] = peakMegabytes(process);
    for (const int agent : servertest::childrenOf(process)) {
        state.counters["agent_MB"] = peakMegabytes(agent);
    }
}

void bareExpat(benchmark::State& state)
{
    TProbeServer& server = TProbeServer::get();
    server.setCount(static_cast<Uint32>(state.range(0)));
    const std::string bytes = server.enumerationBytes();
    for (auto _ : state) {
        XML_Parser parser = XML_ParserCreate(nullptr);
        XML_SetElementHandler(
            parser, [](void*, const char*, const char**) {}, [](void*, const char*) {});
        XML_SetCharacterDataHandler(parser, [](void*, const char*, int) {});
        if (XML_Parse(parser, bytes.data(), static_cast<int>(bytes.size()), 1) != XML_STATUS_OK) {
            state.SkipWithError("not XML");
        }
        XML_ParserFree(parser);
    }
    state.SetBytesProcessed(static_cast<std::int64_t>(bytes.size()) * state.iterations());
}

void getClass(benchmark::State& state)
{
    TProbeServer& server = TProbeServer::get();
    for (auto _ : state) {
        benchmark::DoNotOptimize(server.client().getClass(kNamespace, "Probe_Bulk", false));
    }
    state.SetItemsProcessed(state.iterations());
}

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

void invokeMethod(benchmark::State& state)
{
    TProbeServer& server = TProbeServer::get();
    Array<CIMParamValue> in;
    in.append(CIMParamValue("Text", CIMValue(String("some words"))));
    for (auto _ : state) {
        Array<CIMParamValue> out;
        benchmark::DoNotOptimize(
            server.client().invokeMethod(kNamespace, CIMObjectPath("Probe_Bulk"), "Echo", in, out));
    }
    state.SetItemsProcessed(state.iterations());
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

BENCHMARK(enumerateInstances)->Arg(1'000)->Arg(10'000)->Arg(50'000)->Unit(benchmark::kMillisecond)->UseRealTime();
BENCHMARK(bareExpat)->Arg(1'000)->Arg(10'000)->Arg(50'000)->Unit(benchmark::kMillisecond)->UseRealTime();
BENCHMARK(getClass)->UseRealTime();
BENCHMARK(getClassOnNewConnections)->UseRealTime();
BENCHMARK(requestsOnNewConnections)->UseRealTime();
BENCHMARK(invokeMethod)->UseRealTime();
BENCHMARK(launch)
    ->Unit(benchmark::kMillisecond)
    ->UseRealTime()
    ->Iterations(1)
    ->Repetitions(21)
    ->ReportAggregatesOnly(true);

} // namespace

BENCHMARK_MAIN();
