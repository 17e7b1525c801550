// The least that a host does: loads the plug-in, prints "class count" for every class that it serves, unloads it.
// Usage: tiny_host CONSUMER, with the deployed tree as working directory
#include <host/ICIMClass.h>
#include <host/ICIMInstance.h>
#include <host/ICIMNamespace.h>
#include <host/INamespaceProvider.h>
#include <host/INamespaceProviderManager.h>
#include <host/IProvider.h>
#include <host/PluginSymbols.h>
#include <host/TCIMValue.h>
#include <host/TRootObject.h>

#include <cstdio>
#include <exception>

#include <dlfcn.h>

using namespace NKOLVRX20;

namespace {

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

// Whatever came from the plug-in is gone when this returns.
void UseProvider(const std::string& consumer)
{
    TCIMContext context;
    context["consumer"] = TCIMValue(consumer);
    const auto manager = TRootObject::GetNamespaceProviderManager();
    const auto provider = manager->GetNamespaceProvider("pegasus");
    PrintInventory(*provider->AllocateNamespace(context, false, "root/cimv2"));
    manager->UnregisterNamespaceProvider(provider);
}

} // namespace

int main(int argc, char** argv)
{
    void* const plugin = argc == 2 ? ::dlopen(PLUGIN_FILE, RTLD_NOW | RTLD_LOCAL) : nullptr;
    if (!plugin) {
        std::fprintf(stderr, "%s\n", argc == 2 ? ::dlerror() : "usage: tiny_host CONSUMER");
        return 2;
    }
    typedef void (*TEntryPoint)();
    const auto initialize = reinterpret_cast<TEntryPoint>(::dlsym(plugin, kInitializeSymbol));
    const auto clearNamespace = reinterpret_cast<TEntryPoint>(::dlsym(plugin, kClearNamespaceSymbol));
    int status = 0;
    try {
        initialize();
        UseProvider(argv[1]);
    } catch (const std::exception& e) {
        std::fprintf(stderr, "tiny_host: %s\n", e.what());
        status = 1;
    }
    clearNamespace();
    return ::dlclose(plugin) == 0 ? status : 1;
}
