#pragma once

#include "pegasus/repository/Repository.h"
#include "pegasus/repository/Storage.h"

#include <array>
#include <list>
#include <memory>
#include <string>
#include <unordered_map>

namespace Pegasus::repository {

// Resolved classes, the least recently used ones dropped first, and the encoded forms that were asked for.
// Thread: one thread at a time.
class ClassCache
{
  public:
    explicit ClassCache(std::size_t capacity) : fCapacity(capacity) {}

    // Uninitialised if it is not held.
    CIMClass find(NamespaceId nameSpace, const std::string& foldedName);
    void insert(NamespaceId nameSpace, const std::string& foldedName, const CIMClass& resolved);
    // A held class as a CLASS element: made once, then kept for a while.
    // Requires: the class is held; no property list.
    std::shared_ptr<const std::string> text(NamespaceId nameSpace, const std::string& foldedName,
                                            const ClassOptions& options);
    void remove(NamespaceId nameSpace, const std::string& foldedName);

  private:
    struct Entry
    {
        std::string key;
        CIMClass resolved;
        std::array<std::shared_ptr<const std::string>, 8> texts; // by the three switches of ClassOptions
    };

    static constexpr std::size_t kMaxTextBytes = 8u << 20;

    Entry* touch(const std::string& key);
    void forgetTexts();

    std::size_t fCapacity;
    std::size_t fTextBytes = 0; // at least what is held: a class that goes takes its texts along uncounted
    std::list<Entry> fEntries;  // most recently used first
    std::unordered_map<std::string, std::list<Entry>::iterator> fByKey;
};

} // namespace Pegasus::repository
