#include "pegasus/repository/ClassCache.h"

#include "pegasus/repository/ClassFilter.h"
#include "pegasus/wire/ElementEncoder.h"

namespace Pegasus::repository {

namespace {

std::string keyOf(NamespaceId nameSpace, const std::string& foldedName)
{
    return std::to_string(nameSpace) + ":" + foldedName;
}

std::size_t formIndex(const ClassOptions& options)
{
    return (options.localOnly ? 1u : 0u) | (options.includeQualifiers ? 2u : 0u) |
           (options.includeClassOrigin ? 4u : 0u);
}

} // namespace

ClassCache::Entry* ClassCache::touch(const std::string& key)
{
    const auto found = fByKey.find(key);
    if (found == fByKey.end()) {
        return nullptr;
    }
    fEntries.splice(fEntries.begin(), fEntries, found->second);
    return &fEntries.front();
}

CIMClass ClassCache::find(NamespaceId nameSpace, const std::string& foldedName)
{
    const Entry* entry = touch(keyOf(nameSpace, foldedName));
    return entry ? entry->resolved : CIMClass();
}

void ClassCache::insert(NamespaceId nameSpace, const std::string& foldedName, const CIMClass& resolved)
{
    remove(nameSpace, foldedName);
    fEntries.push_front(Entry{keyOf(nameSpace, foldedName), resolved, {}});
    fByKey[fEntries.front().key] = fEntries.begin();
    if (fEntries.size() > fCapacity) {
        fByKey.erase(fEntries.back().key);
        fEntries.pop_back();
    }
}

std::shared_ptr<const std::string> ClassCache::text(NamespaceId nameSpace, const std::string& foldedName,
                                                    const ClassOptions& options)
{
    Entry& entry = *touch(keyOf(nameSpace, foldedName));
    std::shared_ptr<const std::string>& kept = entry.texts[formIndex(options)];
    if (kept) {
        return kept;
    }
    auto made = std::make_shared<std::string>();
    wire::appendClass(*made, filterClass(entry.resolved, options));
    fTextBytes += made->size();
    if (fTextBytes > kMaxTextBytes) {
        forgetTexts();
        fTextBytes = made->size();
    }
    return kept = made;
}

void ClassCache::forgetTexts()
{
    for (Entry& entry : fEntries) {
        entry.texts = {};
    }
}

void ClassCache::remove(NamespaceId nameSpace, const std::string& foldedName)
{
    const auto found = fByKey.find(keyOf(nameSpace, foldedName));
    if (found == fByKey.end()) {
        return;
    }
    fEntries.erase(found->second);
    fByKey.erase(found);
}

} // namespace Pegasus::repository
