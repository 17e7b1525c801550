// SPDX-License-Identifier: MIT
// The plug-in of a staged tree as its host sees it, through the host's interfaces alone.
//
//   plugin_bench ROOT CONSUMER
//
// Opens the namespace, prints "open", and carries out one command a line of standard input, each answered with the
// count and the seconds it took:
//   instances CLASS            one enumeration, each instance offered to a visitor
//   values CLASS               the same, the visitor reads every property's value
//   classes NAMESPACE FILE     the classes named in the file, a name a line, through ICIMNamespace::GetClass
#include "host/cli/TPrivateServer.h"
#include "host/cli/TSession.h"

#include <host/ICIMClass.h>
#include <host/ICIMInstance.h>
#include <host/ICIMProperty.h>
#include <host/TCIMValue.h>
#include <host/TRootObject.h>

#include <chrono>
#include <cstdio>
#include <exception>
#include <filesystem>
#include <fstream>
#include <functional>
#include <iostream>
#include <sstream>
#include <stdexcept>

using namespace NKOLVRX20;

namespace {

class TQuietLog : public ILogger
{
  public:
    void Log(EVRXLogSeverity, const std::string&) override {}
};

// Returns: the values that are set.
int CountValues(const ICIMInstance& instance)
{
    int count = 0;
    instance.EnumerateProperties(
        [&](boost::shared_ptr<ICIMProperty> property) { return count += !property->GetValue({}).IsNull(), true; }, {});
    return count;
}

int CountInstances(ICIMNamespace& nameSpace, const std::string& className, bool reads)
{
    const boost::shared_ptr<ICIMClass> source = nameSpace.GetClass(className, {});
    int count = 0;
    if (source) {
        source->EnumerateInstances(
            [&](boost::shared_ptr<ICIMInstance> instance) {
                count += !reads || CountValues(*instance) > 0;
                return true;
            },
            false, {});
    }
    return count;
}

int CountClasses(ICIMNamespace& nameSpace, const std::string& cimNamespace, const std::string& file)
{
    std::ifstream names(file);
    int count = 0;
    for (std::string name; std::getline(names, name);) {
        count += nameSpace.GetClass(name, {{"nsp", TCIMValue(cimNamespace)}}) != nullptr;
    }
    return count;
}

void Answer(const std::function<int()>& work)
{
    const auto start = std::chrono::steady_clock::now();
    const int count = work();
    std::printf("%d %.6f\n", count, std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count());
    std::fflush(stdout);
}

void Serve(ICIMNamespace& nameSpace)
{
    std::puts("open");
    std::fflush(stdout);
    for (std::string line; std::getline(std::cin, line);) {
        std::istringstream words(line);
        std::string command;
        std::string first;
        std::string second;
        words >> command >> first >> second;
        Answer([&] {
            return command == "classes" ? CountClasses(nameSpace, first, second)
                                        : CountInstances(nameSpace, first, command == "values");
        });
    }
}

} // namespace

int main(int argc, char** argv)
{
    if (argc != 3) {
        std::fputs("Usage: plugin_bench ROOT CONSUMER\n", stderr);
        return 2;
    }
    try {
        const std::string root = argv[1];
        TQuietLog log;
        TRootObject::SetCoreLogger(&log);
        const std::string planned = vrxhost::TPrivateServer(root, argv[2]).SetConsumer();
        if (!planned.empty()) {
            throw std::runtime_error(planned);
        }
        std::filesystem::current_path(root);
        vrxhost::TSession session(root + "/libpegasus.nsp.so", argv[2]);
        session.Open();
        Serve(session.GetNamespace());
        const std::string fault = session.Close();
        std::fputs(fault.c_str(), stderr);
        TRootObject::SetCoreLogger(nullptr);
        return fault.empty() ? 0 : 1;
    } catch (const std::exception& error) {
        std::fprintf(stderr, "plugin_bench: %s\n", error.what());
        return 1;
    }
}
