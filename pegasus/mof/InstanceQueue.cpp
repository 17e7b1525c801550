// SPDX-License-Identifier: MIT
#include "pegasus/mof/InstanceQueue.h"

#include <Pegasus/Common/Exception.h>

#include <algorithm>

namespace Pegasus::mof {

namespace {

void addReference(ParsedInstance& parsed, const CIMName& name, const CIMObjectPath& path)
{
    const CIMConstProperty declared = parsed.itsClass.getProperty(parsed.itsClass.findProperty(name));
    parsed.instance.addProperty(
        CIMProperty(name, CIMValue(path), 0, declared.getReferenceClassName(), declared.getClassOrigin()));
}

// A path consists of keys only: other references may stay open while the alias gets its path.
bool hasOpenKey(const ParsedInstance& parsed)
{
    Array<CIMName> keys;
    parsed.itsClass.getKeyNames(keys);
    const auto isOpen = [&parsed](const CIMName& key) {
        return std::any_of(parsed.open.begin(), parsed.open.end(),
                           [&key](const OpenReference& reference) { return reference.property.equal(key); });
    };
    return std::any_of(keys.getData(), keys.getData() + keys.size(), isOpen);
}

} // namespace

void InstanceQueue::submit(ParsedInstance parsed)
{
    fWaiting.push_back(std::move(parsed));
    settle();
}

void InstanceQueue::finish() const
{
    if (fWaiting.empty()) {
        return;
    }
    const OpenReference& reference = fWaiting.front().open.front();
    throw MofError(reference.place, "alias $" + reference.alias + " is not defined");
}

// Repeats as long as a round makes progress: another instance may wait for an alias that this round gave its path.
void InstanceQueue::settle()
{
    bool hasProgress = true;
    while (hasProgress && !fWaiting.empty()) {
        hasProgress = false;
        for (auto it = fWaiting.begin(); it != fWaiting.end();) {
            hasProgress = advance(*it) || hasProgress;
            if (it->open.empty()) {
                const ParsedInstance complete = std::move(*it);
                it = fWaiting.erase(it);
                if (!fDelivery.createInstance(complete.instance)) {
                    fDelivery.warn(complete.place, "the instance already exists, it is not changed");
                }
            } else {
                ++it;
            }
        }
    }
}

bool InstanceQueue::advance(ParsedInstance& parsed)
{
    const bool hasResolved = resolve(parsed);
    return nameAlias(parsed) || hasResolved;
}

bool InstanceQueue::resolve(ParsedInstance& parsed) const
{
    const auto isResolved = [this, &parsed](const OpenReference& reference) {
        const CIMObjectPath* path = fAliases.find(reference.alias);
        if (path) {
            addReference(parsed, reference.property, *path);
        }
        return path != nullptr;
    };
    const auto kept = std::remove_if(parsed.open.begin(), parsed.open.end(), isResolved);
    const bool hasResolved = kept != parsed.open.end();
    parsed.open.erase(kept, parsed.open.end());
    return hasResolved;
}

bool InstanceQueue::nameAlias(ParsedInstance& parsed)
{
    if (parsed.alias.empty() || hasOpenKey(parsed)) {
        return false;
    }
    if (!fAliases.define(parsed.alias, parsed.instance.buildPath(parsed.itsClass))) {
        throw MofError(parsed.place, "alias $" + parsed.alias + " is already defined");
    }
    parsed.alias.clear();
    return true;
}

} // namespace Pegasus::mof
