// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/cmpi/module/ProviderModule.h"

#include <cmpi/cmpi.h>

#include <condition_variable>
#include <map>
#include <mutex>
#include <string>

namespace Pegasus::cmpi {

class Broker;
class ProviderLibrary;

// The interfaces that a library's providers have made so far, made at their first use and ended together.
// Thread: all members except the destructor may be called on any thread at any time.
class ProviderInterfaces
{
  public:
    // A request in progress: the interfaces stay as long as one exists.
    // Blocks: while the interfaces are being ended.
    class Use
    {
      public:
        explicit Use(ProviderInterfaces& interfaces);
        ~Use();
        Use(const Use&) = delete;
        Use& operator=(const Use&) = delete;

      private:
        ProviderInterfaces& fInterfaces;
    };

    ProviderInterfaces(const ProviderLibrary& library, Broker& broker) : fLibrary(library), fBroker(broker) {}
    // Ends all of them, whatever they answer.
    ~ProviderInterfaces();
    ProviderInterfaces(const ProviderInterfaces&) = delete;
    ProviderInterfaces& operator=(const ProviderInterfaces&) = delete;

    // Requires: a Use is held.
    // Throws: CIM_ERR_FAILED as ProviderLibrary; CIM_ERR_NOT_SUPPORTED for a provider that lacks an instance
    //     interface, CIM_ERR_METHOD_NOT_AVAILABLE for one that lacks a method interface.
    CMPIInstanceMI& instance(const std::string& provider);
    CMPIMethodMI& method(const std::string& provider);

    // As ProviderModule::cleanupWhenIdle().
    ProviderModule::Cleanup cleanupWhenIdle();

  private:
    struct Provider
    {
        CMPIInstanceMI* instance = nullptr;
        CMPIMethodMI* method = nullptr;
    };

    template <typename Interface>
    Interface* obtain(Interface* Provider::*kept, const char* kind, const std::string& provider);
    template <typename Interface> Interface* make(const char* kind, const std::string& provider) const;
    CMPIrc cleanup(Provider& provider, bool terminating);

    const ProviderLibrary& fLibrary;
    Broker& fBroker;
    std::mutex fUseMutex; // guards the next three; released while a provider runs
    std::condition_variable fCleaned;
    unsigned fUses = 0;
    bool fIsCleaning = false;
    std::mutex fFactoryMutex; // one factory at a time: those of one provider may share what they make
    std::mutex fMakeMutex; // guards the next two; released while a factory runs, so that interfaces already made serve
    std::map<std::string, Provider> fProviders;
    bool fNeverUnload = false;
};

} // namespace Pegasus::cmpi
