#pragma once

#include "pegasus/cmpi/BrokerServices.h"
#include "pegasus/cmpi/ClassSchema.h"

#include <cstdint>
#include <memory>
#include <shared_mutex>
#include <string>
#include <string_view>
#include <unordered_map>

namespace Pegasus::cmpi {

// The classes that providers have named so far. A class is asked for once; the server lets none change or go.
// That a class is unknown is remembered until the next request, in which it may have been compiled.
// Thread: all members.
class ClassCache
{
  public:
    explicit ClassCache(BrokerServices& services) : fServices(services) {}

    // Returns: the class, or null when the server does not know it (or cannot say). It lives as long as the cache.
    // Blocks: as long as the upcall, the first time.
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

    BrokerServices& fServices;
    std::shared_mutex fMutex;
    std::unordered_map<std::string, Entry> fEntries; // by "namespace:class" in lower case
    std::uint64_t fRequest = 0;
};

} // namespace Pegasus::cmpi
