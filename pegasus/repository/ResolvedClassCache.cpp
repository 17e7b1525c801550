// SPDX-License-Identifier: MIT
#include "pegasus/repository/ResolvedClassCache.h"

namespace Pegasus::repository {

namespace {

std::string keyOf(NamespaceId nameSpace, const std::string& nameKey)
{
    return std::to_string(nameSpace) + ":" + nameKey;
}

std::size_t formIndex(const ClassOptions& options)
{
    return (options.localOnly ? 1u : 0u) | (options.includeQualifiers ? 2u : 0u) |
           (options.includeClassOrigin ? 4u : 0u);
}

} // namespace

ResolvedClassCache::Entry* ResolvedClassCache::touch(const std::string& key)
{
    const auto found = fByKey.find(key);
    if (found == fByKey.end()) {
        return nullptr;
    }
    fEntries.splice(fEntries.begin(), fEntries, found->second);
    return &fEntries.front();
}

ResolvedClass ResolvedClassCache::find(NamespaceId nameSpace, const std::string& nameKey)
{
    const Entry* entry = touch(keyOf(nameSpace, nameKey));
    return entry ? entry->resolved : ResolvedClass();
}

void ResolvedClassCache::insert(NamespaceId nameSpace, const std::string& nameKey, const ResolvedClass& resolved)
{
    std::string key = keyOf(nameSpace, nameKey);
    if (Entry* const entry = touch(key)) {
        if (entry->resolved.whole.isUninitialized()) {
            entry->resolved = resolved;
        }
        return;
    }
    fEntries.push_front(Entry{std::move(key), resolved, {}});
    fByKey[fEntries.front().key] = fEntries.begin();
    if (fEntries.size() > fCapacity) {
        fByKey.erase(fEntries.back().key);
        fEntries.pop_back();
    }
}

std::shared_ptr<const std::string> ResolvedClassCache::findText(NamespaceId nameSpace, const std::string& nameKey,
                                                                const ClassOptions& options)
{
    const Entry* entry = touch(keyOf(nameSpace, nameKey));
    return entry ? entry->texts[formIndex(options)] : nullptr;
}

void ResolvedClassCache::keepText(NamespaceId nameSpace, const std::string& nameKey, const ClassOptions& options,
                                  const std::shared_ptr<const std::string>& text)
{
    Entry* entry = touch(keyOf(nameSpace, nameKey));
    if (entry == nullptr || entry->texts[formIndex(options)]) {
        return; // dropped meanwhile, or another request was faster
    }
    fTextBytes += text->size();
    if (fTextBytes > kMaxTextBytes) {
        forgetTexts();
        fTextBytes = text->size();
    }
    entry->texts[formIndex(options)] = text;
}

void ResolvedClassCache::forgetTexts()
{
    for (Entry& entry : fEntries) {
        entry.texts = {};
    }
}

} // namespace Pegasus::repository
