// SPDX-License-Identifier: MIT
// The least that a host does: loads the plug-in, prints "class count" for every class that it serves, unloads it.
// Usage: tiny_host CONSUMER, with the deployed tree as working directory
#include <host/ICIMClass.h>
#include <host/ICIMInstance.h>
#include <host/ICIMNamespace.h>
#include <host/ILogger.h>
#include <host/INamespaceProvider.h>
#include <host/INamespaceProviderManager.h>
#include <host/IProvider.h>
#include <host/PluginSymbols.h>
#include <host/TCIMValue.h>
#include <host/TRootObject.h>

#include <atomic>
#include <chrono>
#include <cstdio>
#include <exception>
#include <random>
#include <stdexcept>
#include <thread>

#include <dlfcn.h>

using namespace NKOLVRX20;

namespace {

using TEntryPoint = void (*)();

void PrintClass(ICIMClass& each)
{
    unsigned int count = 0;
    each.EnumerateInstances(
        [&count](boost::shared_ptr<ICIMInstance>) {
            ++count;
            return true;
        },
        false, {});
    std::printf("%s %u\n", each.GetName({}).c_str(), count);
}

void PrintInventory(ICIMNamespace& ns)
{
    TCIMContext context;
    context["pluginType"] = TCIMValue(static_cast<signed char>(7));
    ns.EnumerateProviders(
        [](boost::shared_ptr<IProvider> provider) {
            provider->EnumerateClassesProvided(
                [](boost::shared_ptr<ICIMClass> each) {
                    PrintClass(*each);
                    return true;
                },
                {});
            return true;
        },
        context);
}

// The core logger, which also notices in the process service's lines that cimserver failed to start. The plug-in
// ignores that: where its client is unable to see whose server answers on the port, that may be the server of
// another host that chose the same port.
class TServerWatch : public ILogger
{
  public:
    TServerWatch() : fNext(*TRootObject::GetCoreLogger()) { TRootObject::SetCoreLogger(this); }
    ~TServerWatch() override { TRootObject::SetCoreLogger(nullptr); }

    void Log(EVRXLogSeverity severity, const std::string& text) override
    {
        if (text.find("TOSSpecific::SpawnProcess cimserver httpPort=") == 0) {
            fFailed = text.find(": exit status 0") == std::string::npos;
        } else if (text.find(" try to restart cimserver ") != std::string::npos) {
            fFailed = false; // the plug-in noticed and starts it again itself
        }
        fNext.Log(severity, text);
    }

    bool HasFailed() const { return fFailed; }
    void Reset() { fFailed = false; }

  private:
    ILogger& fNext;
    std::atomic<bool> fFailed{false}; // lines come from several threads
};

// The plug-in's provider, out of the host's manager again however its use ends: what stayed there would be destroyed by
// the library's code after the library was unloaded.
class TRegisteredProvider
{
  public:
    explicit TRegisteredProvider(TEntryPoint initialize)
    {
        initialize();
        fProvider = TRootObject::GetNamespaceProviderManager()->GetNamespaceProvider("pegasus");
    }
    ~TRegisteredProvider() { TRootObject::GetNamespaceProviderManager()->UnregisterNamespaceProvider(fProvider); }
    TRegisteredProvider(const TRegisteredProvider&) = delete;
    TRegisteredProvider& operator=(const TRegisteredProvider&) = delete;

    INamespaceProvider* operator->() const { return fProvider.get(); }

  private:
    boost::shared_ptr<INamespaceProvider> fProvider;
};

// Everything that came from the plug-in is gone when this returns or throws.
void UseProvider(TEntryPoint initialize, TEntryPoint clearNamespace, const std::string& consumer)
{
    constexpr int kAttempts = 3;
    constexpr int kLongestPauseMs = 500; // times the attempt's number
    TServerWatch watch;
    const TRegisteredProvider provider(initialize);
    TCIMContext context;
    context["consumer"] = TCIMValue(consumer);
    std::random_device random;
    for (int attempt = 1; attempt <= kAttempts; ++attempt) {
        watch.Reset();
        auto ns = provider->AllocateNamespace(context, false, "root/cimv2");
        if (!watch.HasFailed()) {
            PrintInventory(*ns);
            return;
        }
        ns.reset();
        clearNamespace();
        std::uniform_int_distribution<int> pauseMs(0, attempt * kLongestPauseMs);
        std::this_thread::sleep_for(std::chrono::milliseconds(pauseMs(random)));
    }
    throw std::runtime_error("cimserver did not start");
}

} // namespace

int main(int argc, char** argv)
{
    void* const plugin = argc == 2 ? ::dlopen(PLUGIN_FILE, RTLD_NOW | RTLD_LOCAL) : nullptr;
    if (!plugin) {
        std::fprintf(stderr, "%s\n", argc == 2 ? ::dlerror() : "usage: tiny_host CONSUMER");
        return 2;
    }
    const auto initialize = reinterpret_cast<TEntryPoint>(::dlsym(plugin, kInitializeSymbol));
    const auto clearNamespace = reinterpret_cast<TEntryPoint>(::dlsym(plugin, kClearNamespaceSymbol));
    int status = 0;
    try {
        UseProvider(initialize, clearNamespace, argv[1]);
    } catch (const std::exception& e) {
        std::fprintf(stderr, "tiny_host: %s\n", e.what());
        status = 1;
    } catch (...) { // exceptions of the client library have a base class of their own
        std::fprintf(stderr, "tiny_host: an exception of the client library\n");
        status = 1;
    }
    clearNamespace();
    return ::dlclose(plugin) == 0 ? status : 1;
}
