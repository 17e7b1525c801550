// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/cmpi/services/BrokerServices.h"
#include "pegasus/cmpi/services/ClassSchema.h"

#include <cstdint>
#include <memory>
#include <shared_mutex>
#include <string>
#include <string_view>
#include <unordered_map>

namespace Pegasus::cmpi {

// The classes that providers have named so far. Each is asked for once, since classes of the server stay as they
// are. An unknown class is remembered as such until the next request, because it may have been compiled meanwhile.
// Thread: all members may be called on any thread at any time.
class SchemaCache
{
  public:
    // Requires: `services` outlives the cache.
    explicit SchemaCache(BrokerServices& services) : fServices(services) {}

    // Returns: the class, or null when the class is unknown to the server or the server fails to answer (the failure is
    //     logged).
    // Ownership: the cache's; the class lives as long as the cache.
    // Blocks: the first time, as long as BrokerServices::getClass.
    const ClassSchema* find(std::string_view nameSpace, std::string_view className);

    // Forgets which classes were unknown.
    void beginRequest();

  private:
    struct Entry
    {
        std::unique_ptr<ClassSchema> schema; // null: unknown in request `asked`
        std::uint64_t asked = 0;
    };

    std::unique_ptr<ClassSchema> load(std::string_view nameSpace, std::string_view className);
    void logFailure(std::string_view nameSpace, std::string_view className, const Exception& error);

    BrokerServices& fServices;
    std::shared_mutex fMutex;                        // guards the next two; released during an upcall
    std::unordered_map<std::string, Entry> fEntries; // by "namespace:class" in lower case; entries stay
    std::uint64_t fRequest = 0;                      // number of the current request
};

} // namespace Pegasus::cmpi
