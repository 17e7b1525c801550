// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/repository/Repository.h"
#include "pegasus/server/agent/AgentPool.h"

#include <mutex>
#include <optional>
#include <string>
#include <unordered_map>
#include <vector>

namespace Pegasus::server {

// PG_ProviderCapabilities.ProviderType
enum class ProviderType : unsigned
{
    kInstance = 2,
    kMethod = 5
};

// The registrations: instances of PG_ProviderModule, PG_Provider and PG_ProviderCapabilities in root/PG_InterOp, which
// the repository keeps; this class checks new ones and finds the provider of a class.
//
// Thread: any.
class ProviderRegistry
{
  public:
    // Requires: the repository outlives this.
    explicit ProviderRegistry(repository::Repository& repository) : fRepository(repository) {}

    // Returns: whether instances of this class are registrations, which only registerInstance() stores.
    static bool isRegistration(const CIMNamespaceName& nameSpace, const CIMName& className);

    // Checks and stores a registration. Returns: its path.
    // Throws: CIMException: CIM_ERR_INVALID_PARAMETER (a required property is missing), CIM_ERR_NOT_SUPPORTED (a value
    // that is unknown to this server), CIM_ERR_FAILED (out of order, or another provider has the class already), and
    // what the repository throws.
    CIMObjectPath registerInstance(const CIMInstance& instance);

    // Removes a registration and those that build on it: a provider's capabilities, a module's providers. A module's
    // agent that runs serves the requests that it has.
    // Throws: CIM_ERR_NOT_FOUND, and what else the repository throws.
    void removeInstance(const CIMObjectPath& path);

    // Returns: the provider of a class itself, whatever its superclass has; nullopt when absent.
    // Throws: what the repository throws.
    std::optional<ProviderReference> find(const CIMNamespaceName& nameSpace, const CIMName& className,
                                          ProviderType type);

  private:
    struct Capability
    {
        unsigned type = 0;
        ProviderReference provider;
    };
    using Index = std::unordered_map<std::string, std::vector<Capability>>; // by folded "namespace:class"

    void load();
    void checkNotTaken(const CIMInstance& capabilities);

    repository::Repository& fRepository;
    std::mutex fMutex;
    std::mutex fRegistration; // one registration at a time: check and store
    bool fLoaded = false;
    Index fIndex;
};

} // namespace Pegasus::server
