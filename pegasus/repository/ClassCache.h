#pragma once

#include "pegasus/repository/Repository.h"
#include "pegasus/repository/Storage.h"

#include <array>
#include <list>
#include <string>
#include <unordered_map>

namespace Pegasus::repository {

/// Resolved classes and the filtered forms that were asked for, the least recently used ones dropped first.
/// Thread: one thread at a time.
class ClassCache
{
  public:
    explicit ClassCache(std::size_t capacity) : fCapacity(capacity) {}

    /// Uninitialised if it is not held.
    CIMClass find(NamespaceId nameSpace, const std::string& foldedName);
    void insert(NamespaceId nameSpace, const std::string& foldedName, const CIMClass& resolved);
    /// The form of a held class without a property list: made once, then kept. Uninitialised if the class is not held.
    CIMClass filtered(NamespaceId nameSpace, const std::string& foldedName, const ClassOptions& options);
    void remove(NamespaceId nameSpace, const std::string& foldedName);

  private:
    struct Entry
    {
        std::string key;
        CIMClass resolved;
        std::array<CIMClass, 8> forms; ///< by the three switches of ClassOptions; uninitialised: not asked for yet
    };

    Entry* touch(const std::string& key);

    std::size_t fCapacity;
    std::list<Entry> fEntries; ///< most recently used first
    std::unordered_map<std::string, std::list<Entry>::iterator> fByKey;
};

} // namespace Pegasus::repository
