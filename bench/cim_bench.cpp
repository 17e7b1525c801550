// SPDX-License-Identifier: MIT
// A CIM server as its client sees it, through the public client interface alone: it is built with the embedded client
// library or with an installed OpenPegasus's, and works on any server that listens on the loopback interface.
//
//   cim_bench PORT NAMESPACE CLASS [--server PID] [--rounds N] [--before METHOD PARAMETER NUMBER]
//             [--method METHOD PARAMETER TEXT] [--class CLASS]
//
// PORT may be "local", the server's local socket. --before calls a method with a uint32 once, --method measures calls
// with a string, --class GetClass of another class. With --server, the processor time of that process and of its
// children (the agents) is shown too. Each line has a name, a figure and a unit, separated by tabs; a figure is the
// median of the rounds (9).
#include "bench/ReadValues.h"

#include <Pegasus/Client/CIMClient.h>

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <ctime>
#include <filesystem>
#include <fstream>
#include <functional>
#include <map>
#include <stdexcept>
#include <string>
#include <vector>

#include <unistd.h>

using namespace Pegasus;

namespace {

constexpr int kCallsOfARound = 2000;
constexpr Uint32 kTimeoutMs = 600'000;

struct TArguments
{
    std::string fPort;
    CIMNamespaceName fNamespace;
    CIMName fClass;
    pid_t fServer = 0;
    int fRounds = 9;
    std::vector<std::string> fBefore; // method, parameter, number
    std::vector<std::string> fMethod; // method, parameter, text
    std::string fOtherClass;          // none when empty
};

using TTimes = std::map<std::string, double>; // process -> seconds of processor time

double median(std::vector<double> values)
{
    std::sort(values.begin(), values.end());
    return values[values.size() / 2];
}

void print(const std::string& name, double value, const char* unit)
{
    std::printf("%s\t%.5g\t%s\n", name.c_str(), value, unit);
}

double now(clockid_t clock)
{
    timespec time{};
    ::clock_gettime(clock, &time);
    return double(time.tv_sec) + double(time.tv_nsec) * 1e-9;
}

double processorSeconds(pid_t process)
{
    clockid_t clock{};
    return ::clock_getcpuclockid(process, &clock) == 0 ? now(clock) : 0;
}

// Children and theirs: between a server and its agents there may be other processes.
std::vector<pid_t> descendantsOf(pid_t process)
{
    std::vector<pid_t> found;
    for (const auto& thread : std::filesystem::directory_iterator("/proc/" + std::to_string(process) + "/task")) {
        std::ifstream list(thread.path() / "children");
        for (pid_t child = 0; list >> child;) {
            found.push_back(child);
            const std::vector<pid_t> below = descendantsOf(child);
            found.insert(found.end(), below.begin(), below.end());
        }
    }
    return found;
}

// The processor time of this process as "client", of the server, and of all the processes below it as "agents".
TTimes processorTimes(pid_t server)
{
    TTimes times = {{"client", now(CLOCK_PROCESS_CPUTIME_ID)}};
    if (server != 0) {
        times["server"] = processorSeconds(server);
        for (const pid_t process : descendantsOf(server)) {
            times["agents"] += processorSeconds(process);
        }
    }
    return times;
}

// The peak of a process's resident memory.
double peakMegabytes(const std::string& process)
{
    std::ifstream status("/proc/" + process + "/status");
    for (std::string line; std::getline(status, line);) {
        if (line.rfind("VmHWM:", 0) == 0) {
            return std::stod(line.substr(sizeof "VmHWM:")) / 1024;
        }
    }
    return 0;
}

void printPeaks(const std::string& name, pid_t server)
{
    if (server == 0) {
        return;
    }
    print(name + ", server's peak", peakMegabytes(std::to_string(server)), "MB");
    double agents = 0;
    for (const pid_t process : descendantsOf(server)) {
        agents = std::max(agents, peakMegabytes(std::to_string(process)));
    }
    print(name + ", agent's peak", agents, "MB");
}

// The rate of `items` a round, and each process's time for one of them.
void measure(const std::string& name, double items, const TArguments& arguments, const std::function<void()>& round)
{
    std::vector<double> rates;
    std::map<std::string, std::vector<double>> microseconds;
    for (int i = 0; i < arguments.fRounds; ++i) {
        TTimes before = processorTimes(arguments.fServer);
        const double start = now(CLOCK_MONOTONIC);
        round();
        rates.push_back(items / (now(CLOCK_MONOTONIC) - start));
        for (const auto& [process, seconds] : processorTimes(arguments.fServer)) {
            microseconds[process].push_back((seconds - before[process]) * 1e6 / items);
        }
    }
    print(name, median(rates), "/s");
    print(name + ", slowest round over fastest",
          *std::max_element(rates.begin(), rates.end()) / *std::min_element(rates.begin(), rates.end()), "x");
    for (const auto& [process, values] : microseconds) {
        print(name + ", " + process, median(values), "us");
    }
}

void invoke(CIMClient& client, const TArguments& arguments, const std::vector<std::string>& method,
            const CIMValue& value)
{
    Array<CIMParamValue> in;
    Array<CIMParamValue> out;
    in.append(CIMParamValue(String(method[1].c_str()), value));
    client.invokeMethod(arguments.fNamespace, CIMObjectPath(String(), CIMNamespaceName(), arguments.fClass),
                        CIMName(method[0].c_str()), in, out);
}

void measureGetClass(CIMClient& client, const std::string& name, const CIMName& className, const TArguments& arguments)
{
    measure(name, kCallsOfARound, arguments, [&] {
        for (int i = 0; i < kCallsOfARound; ++i) {
            client.getClass(arguments.fNamespace, className, false);
        }
    });
}

void run(const TArguments& arguments)
{
    CIMClient client;
    client.setTimeout(kTimeoutMs);
    if (arguments.fPort == "local") {
        client.connectLocal();
    } else {
        client.connect("127.0.0.1", Uint32(std::stoul(arguments.fPort)), String(), String());
    }
    if (!arguments.fBefore.empty()) {
        invoke(client, arguments, arguments.fBefore, CIMValue(Uint32(std::stoul(arguments.fBefore[2]))));
    }
    const auto instances = [&] { return client.enumerateInstances(arguments.fNamespace, arguments.fClass); };
    const auto enumerate = [&] { return instances().size(); };
    const double idle = peakMegabytes("self");
    const Uint32 count = enumerate();
    if (count == 0) {
        throw std::runtime_error("the class has no instances");
    }
    print("instances", count, "");
    print("EnumerateInstances, client's memory for an instance", (peakMegabytes("self") - idle) * 1024 / count, "KB");
    measure("EnumerateInstances", count, arguments, [&] {
        if (enumerate() != count) {
            throw std::runtime_error("the number of instances changed");
        }
    });
    measure("EnumerateInstances, values read", count, arguments, [&] { bench::readValues(instances()); });
    print("EnumerateInstances, values read, client's memory for an instance",
          (peakMegabytes("self") - idle) * 1024 / count, "KB");
    printPeaks("EnumerateInstances", arguments.fServer);
    measureGetClass(client, "GetClass", arguments.fClass, arguments);
    if (!arguments.fOtherClass.empty()) {
        measureGetClass(client, "GetClass of " + arguments.fOtherClass, CIMName(arguments.fOtherClass.c_str()),
                        arguments);
    }
    if (!arguments.fMethod.empty()) {
        const CIMValue text(String(arguments.fMethod[2].c_str()));
        measure("InvokeMethod", kCallsOfARound, arguments, [&] {
            for (int i = 0; i < kCallsOfARound; ++i) {
                invoke(client, arguments, arguments.fMethod, text);
            }
        });
    }
}

TArguments parse(const std::vector<std::string>& words)
{
    if (words.size() < 3) {
        throw std::invalid_argument("PORT, NAMESPACE and CLASS are needed");
    }
    TArguments arguments;
    arguments.fPort = words[0];
    arguments.fNamespace = CIMNamespaceName(words[1].c_str());
    arguments.fClass = CIMName(words[2].c_str());
    for (std::size_t i = 3; i < words.size(); ++i) {
        const auto take = [&](std::size_t count) {
            if (i + count >= words.size()) {
                throw std::invalid_argument(words[i] + " needs " + std::to_string(count) + " words");
            }
            i += count;
            return std::vector<std::string>(words.begin() + long(i - count) + 1, words.begin() + long(i) + 1);
        };
        if (words[i] == "--server") {
            arguments.fServer = pid_t(std::stol(take(1)[0]));
        } else if (words[i] == "--rounds") {
            arguments.fRounds = std::max(1, std::stoi(take(1)[0]));
        } else if (words[i] == "--before") {
            arguments.fBefore = take(3);
        } else if (words[i] == "--method") {
            arguments.fMethod = take(3);
        } else if (words[i] == "--class") {
            arguments.fOtherClass = take(1)[0];
        } else {
            throw std::invalid_argument("unknown word " + words[i]);
        }
    }
    return arguments;
}

} // namespace

int main(int argc, char** argv)
{
    try {
        run(parse(std::vector<std::string>(argv + 1, argv + argc)));
        return 0;
    } catch (const std::invalid_argument& error) {
        std::fprintf(stderr,
                     "cim_bench: %s\nUsage: cim_bench PORT NAMESPACE CLASS [--server PID] [--rounds N] "
                     "[--before METHOD PARAMETER NUMBER] [--method METHOD PARAMETER TEXT]\n",
                     error.what());
        return 2;
    } catch (const Exception& error) {
        std::fprintf(stderr, "cim_bench: %s\n", static_cast<const char*>(error.getMessage().getCString()));
    } catch (const std::exception& error) {
        std::fprintf(stderr, "cim_bench: %s\n", error.what());
    }
    return 1;
}
