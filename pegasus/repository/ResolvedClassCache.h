// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/repository/Repository.h"
#include "pegasus/repository/Storage.h"

#include <array>
#include <list>
#include <memory>
#include <string>
#include <unordered_map>

namespace Pegasus::repository {

// A class with everything that it inherits.
struct ResolvedClass
{
    CIMClass whole;
    std::size_t depth = 0; // 1 for a root class, 0 for a class that is absent
    // The class as it was created, in place of `whole` until somebody asks for it. Most classes of a schema have no
    // subclass, and few of them are read.
    CIMClass created = CIMClass();
};

// Resolved classes, at most so many; the least recently used one is dropped first. Each keeps the encoded forms that
// clients asked for. Entries stay valid, since a stored class stays as it is.
// Thread: one thread at a time.
class ResolvedClassCache
{
  public:
    explicit ResolvedClassCache(std::size_t capacity) : fCapacity(capacity) {}

    ResolvedClass find(NamespaceId nameSpace, const std::string& nameKey);
    // Keeps the class, unless the cache has the whole of it.
    void insert(NamespaceId nameSpace, const std::string& nameKey, const ResolvedClass& resolved);
    // Returns: the class as a CLASS element, if keepText() got it; null else.
    // Requires: the options have no property list.
    std::shared_ptr<const std::string> findText(NamespaceId nameSpace, const std::string& nameKey,
                                                const ClassOptions& options);
    // Keeps a text for a while, if the class is in the cache.
    void keepText(NamespaceId nameSpace, const std::string& nameKey, const ClassOptions& options,
                  const std::shared_ptr<const std::string>& text);

  private:
    struct Entry
    {
        std::string key;
        ResolvedClass resolved;
        std::array<std::shared_ptr<const std::string>, 8> texts; // by the three switches of ClassOptions
    };

    static constexpr std::size_t kMaxTextBytes = 8u << 20;

    Entry* touch(const std::string& key);
    void forgetTexts();

    std::size_t fCapacity;
    std::size_t fTextBytes = 0; // upper bound of what is kept: texts of dropped classes are still in it
    std::list<Entry> fEntries;  // most recently used first
    std::unordered_map<std::string, std::list<Entry>::iterator> fByKey;
};

} // namespace Pegasus::repository
