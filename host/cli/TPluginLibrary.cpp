// SPDX-License-Identifier: MIT
#include "host/cli/TPluginLibrary.h"

#include "host/cli/model/ErrorReport.h"

#include <host/INamespaceProviderManager.h>
#include <host/PluginSymbols.h>
#include <host/TRootObject.h>

#include <atomic>
#include <chrono>
#include <filesystem>
#include <iterator>
#include <thread>

#include <dlfcn.h>

namespace vrxhost {
namespace {

using NKOLVRX20::TCIMContext;
using NKOLVRX20::TRootObject;

// The name by which the plug-in's provider is asked for.
constexpr char kProviderName[] = "pegasus";

std::atomic<bool> gHasLeftThreads{false};

std::size_t ThreadCount()
{
    namespace fs = std::filesystem;
    return static_cast<std::size_t>(std::distance(fs::directory_iterator("/proc/self/task"), {}));
}

// A joined thread stays in the list for a moment longer.
bool AwaitThreadCount(std::size_t count)
{
    const auto deadline = std::chrono::steady_clock::now() + std::chrono::seconds(1);
    while (ThreadCount() > count) {
        if (std::chrono::steady_clock::now() > deadline) {
            return false;
        }
        std::this_thread::sleep_for(std::chrono::milliseconds(5));
    }
    return true;
}

} // namespace

TPluginLibrary::TPluginLibrary(const std::string& path) : fPath(path), fThreadCountBefore(ThreadCount())
{
    const std::string error = ErrorOf([this] { fHandle = ::dlopen(fPath.c_str(), RTLD_NOW | RTLD_LOCAL); });
    if (!error.empty()) {
        throw TPluginError(ELossKind::kPluginLoad, "the plug-in " + fPath + " could not be loaded: " + error);
    }
    if (!fHandle) {
        throw TPluginError(ELossKind::kPluginLoad, std::string("the plug-in could not be loaded: ") + ::dlerror());
    }
    try {
        Register();
    } catch (const TPluginError&) {
        Unregister();
        throw;
    }
}

TPluginLibrary::~TPluginLibrary()
{
    if (fHandle) {
        Unload();
    }
}

bool TPluginLibrary::HasLeftThreads()
{
    return gHasLeftThreads;
}

TPluginLibrary::TEntryPoint TPluginLibrary::Symbol(const char* name) const
{
    void* const symbol = ::dlsym(fHandle, name);
    if (!symbol) {
        throw TPluginError(ELossKind::kPluginKind,
                           fPath + " is not a namespace-provider plug-in: it lacks the symbol " + name);
    }
    return reinterpret_cast<TEntryPoint>(symbol);
}

void TPluginLibrary::Register()
{
    const TEntryPoint initialize = Symbol(NKOLVRX20::kInitializeSymbol);
    fClearNamespace = Symbol(NKOLVRX20::kClearNamespaceSymbol);
    std::string error = ErrorOf([&] { initialize(); });
    if (!error.empty()) {
        throw TPluginError(ELossKind::kPlugin, "the plug-in " + fPath + " could not be initialised: " + error);
    }
    error =
        ErrorOf([&] { fProvider = TRootObject::GetNamespaceProviderManager()->GetNamespaceProvider(kProviderName); });
    if (!error.empty()) {
        throw TPluginError(ELossKind::kPlugin, "the plug-in " + fPath + " could not be asked for its name: " + error);
    }
    if (!fProvider) {
        throw TPluginError(ELossKind::kPluginKind,
                           "the plug-in " + fPath + " registered no provider named \"" + kProviderName + "\"");
    }
}

void TPluginLibrary::Unregister()
{
    TRootObject::GetNamespaceProviderManager()->UnregisterNamespaceProvider(fProvider);
    fProvider.reset();
}

std::string TPluginLibrary::Clear()
{
    const std::string error = ErrorOf([this] { fClearNamespace(); });
    return error.empty() ? "" : "the plug-in could not shut its namespace down: " + error;
}

std::string TPluginLibrary::Unload()
{
    std::string problems = Clear();
    Unregister();
    void* const handle = std::exchange(fHandle, nullptr);
    if (AwaitThreadCount(fThreadCountBefore)) {
        ::dlclose(handle);
    } else {
        gHasLeftThreads = true;
        problems += std::string(problems.empty() ? "" : "; ") + "the plug-in left threads behind and stays loaded";
    }
    return problems;
}

} // namespace vrxhost
