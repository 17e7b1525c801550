// SPDX-License-Identifier: MIT
// The time to compile a schema, and the rate at which its classes are read back.
//   schema_bench TOP.mof [ROUNDS]
// Prints one line a measure: the median of the rounds, the minimum and the maximum. Each round starts a server in a
// tree of its own; its start is part of the compile time.
#include "pegasus/mof/Compiler.h"
#include "pegasus/mof/MemoryHandler.h"
#include "tests/support/PrivateServer.h"

#include <Pegasus/Client/CIMClient.h>

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <functional>
#include <stdexcept>
#include <string>
#include <vector>

using namespace Pegasus;

namespace {

using Clock = std::chrono::steady_clock;

constexpr int kGetClassCount = 5000;

double secondsOf(const std::function<void()>& work)
{
    const Clock::time_point start = Clock::now();
    work();
    return std::chrono::duration<double>(Clock::now() - start).count();
}

void print(const char* name, std::vector<double> values, const char* unit)
{
    std::sort(values.begin(), values.end());
    std::printf("%-44s %10.3f  (%.3f - %.3f) %s\n", name, values[values.size() / 2], values.front(), values.back(),
                unit);
}

void parse(const std::string& file)
{
    mof::MemoryHandler handler;
    mof::CompileOptions options;
    options.nameSpace = CIMNamespaceName("root/bench");
    options.allowExperimental = true;
    mof::compileFile(file, options, handler);
}

void compileInto(const test::PrivateServer& server, const std::string& file)
{
    const test::ProgramResult result = server.run("cimmof", {"-n", "root/bench", "-aE", file});
    if (result.exitStatus != 0) {
        throw std::runtime_error("cimmof: " + result.err);
    }
}

// Classes a second over one connection, the whole class with its qualifiers.
double getClassRate(const test::PrivateServer& server)
{
    CIMClient client;
    client.connect(String("127.0.0.1"), static_cast<Uint32>(server.port()), String(), String());
    const CIMNamespaceName nameSpace("root/bench");
    const Array<CIMName> names = client.enumerateClassNames(nameSpace, CIMName(), true);
    const double seconds = secondsOf([&] {
        for (int i = 0; i < kGetClassCount; ++i) {
            client.getClass(nameSpace, names[static_cast<Uint32>(i) % std::min(names.size(), 20u)], false);
        }
    });
    return kGetClassCount / seconds;
}

void measure(const std::string& file, int rounds)
{
    std::vector<double> parsing;
    std::vector<double> compiling;
    std::vector<double> again;
    std::vector<double> reading;
    for (int round = 0; round < rounds; ++round) {
        parsing.push_back(secondsOf([&] { parse(file); }));
        test::PrivateServer server;
        compiling.push_back(secondsOf([&] {
            server.start();
            compileInto(server, file);
        }));
        again.push_back(secondsOf([&] { compileInto(server, file); }));
        reading.push_back(getClassRate(server));
    }
    print("parse only", parsing, "s");
    print("server start and cimmof into it", compiling, "s");
    print("cimmof again (every class exists)", again, "s");
    print("GetClass, 20 classes in turn, one connection", reading, "/s");
}

} // namespace

int main(int argc, char** argv)
{
    if (argc < 2) {
        std::fprintf(stderr, "Usage: schema_bench TOP.mof [ROUNDS]\n");
        return 2;
    }
    try {
        measure(argv[1], argc > 2 ? std::stoi(argv[2]) : 5);
        return 0;
    } catch (const Exception& error) {
        std::fprintf(stderr, "schema_bench: %s\n", static_cast<const char*>(error.getMessage().getCString()));
    } catch (const std::exception& error) {
        std::fprintf(stderr, "schema_bench: %s\n", error.what());
    }
    return 1;
}
