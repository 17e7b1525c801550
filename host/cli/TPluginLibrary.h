// SPDX-License-Identifier: MIT
#pragma once

#include "host/cli/model/Loss.h"

#include <host/INamespaceProvider.h>

#include <boost/shared_ptr.hpp>

#include <cstddef>
#include <string>

namespace vrxhost {

// Why a plug-in is unusable, as a sentence.
class TPluginError : public TFailure
{
  public:
    using TFailure::TFailure;
};

// A loaded plug-in: its library, its entry points, and its provider in the host's manager.
// Thread: one at a time.
class TPluginLibrary
{
  public:
    // Loads the library and has it register its provider.
    // Throws: TPluginError. A library that failed half way stays loaded: it may have left something behind.
    explicit TPluginLibrary(const std::string& path);
    ~TPluginLibrary();

    TPluginLibrary(const TPluginLibrary&) = delete;
    TPluginLibrary& operator=(const TPluginLibrary&) = delete;

    const boost::shared_ptr<NKOLVRX20::INamespaceProvider>& GetProvider() const { return fProvider; }

    // Has the plug-in shut its namespace down. Requires: everything that came from the namespace is released.
    // Returns: empty, or what went wrong, as a sentence.
    std::string Clear();

    // Clears and unloads the library. Requires: everything that came from the plug-in is released.
    // Returns: empty, or what went wrong, as sentences; a library that left threads behind stays loaded.
    // Blocks: for the plug-in's own shutdown, and up to a second more for its threads to end.
    std::string Unload();

    // Returns: true once a library stayed loaded because of its threads: the process must then end without clean-up.
    static bool HasLeftThreads();

  private:
    using TEntryPoint = void (*)();

    TEntryPoint Symbol(const char* name) const;
    void Register();
    void Unregister();

    std::string fPath;
    std::size_t fThreadCountBefore;
    void* fHandle = nullptr;
    TEntryPoint fClearNamespace = nullptr;
    boost::shared_ptr<NKOLVRX20::INamespaceProvider> fProvider;
};

} // namespace vrxhost
