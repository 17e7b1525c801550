// SPDX-License-Identifier: MIT
#include "host/cli/model/Comparison.h"

#include "host/cli/model/Names.h"

#include <algorithm>
#include <map>
#include <set>

#include <strings.h>

namespace vrxhost {
namespace {

struct TNameOrder
{
    bool operator()(const std::string& left, const std::string& right) const
    {
        return ::strcasecmp(left.c_str(), right.c_str()) < 0;
    }
};

using TClasses = std::map<std::string, std::vector<const TClassRecord*>, TNameOrder>; // several providers may serve one
using TInstances = std::map<std::string, const TInstanceRecord*>;

TClasses ClassesOf(const TSide& side)
{
    TClasses classes;
    for (const TProviderRecord& provider : side.fProviders) {
        for (const TClassRecord& each : provider.fClasses) {
            classes[each.fName].push_back(&each);
        }
    }
    return classes;
}

// By path; the second instance of one path, in a class without keys, has "#2" after it.
TInstances InstancesOf(const std::vector<const TClassRecord*>& classes)
{
    TInstances instances;
    std::map<std::string, std::size_t> counts;
    for (const TClassRecord* each : classes) {
        for (const TInstanceRecord& instance : each->fInstances) {
            const std::size_t count = ++counts[instance.fPath];
            instances[instance.fPath + (count == 1 ? "" : " #" + std::to_string(count))] = &instance;
        }
    }
    return instances;
}

bool Names(const TLoss& loss, const std::string& className)
{
    return std::any_of(loss.fClasses.begin(), loss.fClasses.end(),
                       [&](const std::string& name) { return IsSame(name, className); });
}

// Returns: why instances of the class may be missing on that side, as a sentence; empty when they cannot be.
std::string DoubtAbout(const std::string& className, const TSide& side)
{
    for (const TLoss& loss : side.fLosses) {
        if (loss.fIsNote) {
            continue;
        }
        if (loss.fProperty.empty() && Names(loss, className)) {
            return className + " was not complete in " + side.fName;
        }
        if (loss.fClasses.empty()) {
            return side.fName + " was not complete";
        }
    }
    return "";
}

bool IsPropertyLost(const std::string& className, const std::string& property, const TSide& side)
{
    return std::any_of(side.fLosses.begin(), side.fLosses.end(),
                       [&](const TLoss& loss) { return Names(loss, className) && IsSame(loss.fProperty, property); });
}

const TPropertyDeclRecord* FindDeclaration(const std::vector<const TClassRecord*>& classes, const std::string& name)
{
    for (const TClassRecord* each : classes) {
        if (const TPropertyDeclRecord* const declaration = each->Find(name)) {
            return declaration;
        }
    }
    return nullptr;
}

class TComparer
{
  public:
    TComparer(const TSide& from, const TSide& to) : fFrom(from), fTo(to)
    {
        fResult.fFrom = from.fName;
        fResult.fTo = to.fName;
    }

    TComparison Run()
    {
        const TClasses from = ClassesOf(fFrom);
        const TClasses to = ClassesOf(fTo);
        std::set<std::string, TNameOrder> names;
        for (const TClasses* classes : {&from, &to}) {
            for (const auto& each : *classes) {
                names.insert(each.first);
            }
        }
        for (const std::string& name : names) {
            const auto before = from.find(name);
            const auto after = to.find(name);
            if (after == to.end()) {
                Miss(name, "", EDifference::kRemoved, fTo);
            } else if (before == from.end()) {
                Miss(name, "", EDifference::kAdded, fFrom);
            } else {
                CompareClasses(name, before->second, after->second);
            }
        }
        return std::move(fResult);
    }

  private:
    // Something is missing on one side. Of an uncertain class one sentence is enough.
    void Miss(const std::string& className, const std::string& path, EDifference kind, const TSide& side)
    {
        const std::string doubt = DoubtAbout(className, side);
        if (doubt.empty()) {
            fResult.fDifferences.push_back({kind, className, path, {}, {}, {}, ""});
        } else if (fDoubts.insert(className + "\n" + doubt).second) {
            fResult.fDifferences.push_back({EDifference::kUnknown, className, "", {}, {}, {}, doubt});
        }
    }

    void CompareClasses(const std::string& name, const std::vector<const TClassRecord*>& before,
                        const std::vector<const TClassRecord*>& after)
    {
        const TInstances from = InstancesOf(before);
        const TInstances to = InstancesOf(after);
        for (const auto& [path, instance] : from) {
            const auto other = to.find(path);
            if (other == to.end()) {
                Miss(name, path, EDifference::kRemoved, fTo);
                continue;
            }
            for (const std::string& property : PropertyNames(*instance, *other->second)) {
                const TPropertyDeclRecord* const oldDeclaration = FindDeclaration(before, property);
                const TPropertyDeclRecord* const declaration = FindDeclaration(after, property);
                const bool isVolatile =
                    (oldDeclaration && oldDeclaration->fIsVolatile) || (declaration && declaration->fIsVolatile);
                if (!isVolatile) {
                    CompareProperty({EDifference::kChanged, name, path, {}, {}, {}, ""}, property,
                                    declaration ? declaration : oldDeclaration, instance->Find(property),
                                    other->second->Find(property));
                }
            }
        }
        for (const auto& each : to) {
            if (from.count(each.first) == 0) {
                Miss(name, each.first, EDifference::kAdded, fFrom);
            }
        }
    }

    static std::vector<std::string> PropertyNames(const TInstanceRecord& from, const TInstanceRecord& to)
    {
        std::set<std::string, TNameOrder> names;
        for (const TInstanceRecord* instance : {&from, &to}) {
            for (const TPropertyRecord& property : instance->fProperties) {
                names.insert(property.fName);
            }
        }
        return {names.begin(), names.end()};
    }

    void CompareProperty(TDifference difference, const std::string& name, const TPropertyDeclRecord* declaration,
                         const TPropertyRecord* from, const TPropertyRecord* to)
    {
        const bool wasNull = !from || from->fValue.IsNull();
        const bool isNull = !to || to->fValue.IsNull();
        if ((wasNull && isNull) || (!wasNull && !isNull && from->fValue == to->fValue)) {
            return;
        }
        for (const auto& [side, isMissing] : {std::pair<const TSide&, bool>(fFrom, !from), {fTo, !to}}) {
            if (isMissing && IsPropertyLost(difference.fClass, name, side)) {
                difference.fKind = EDifference::kUnknown;
                difference.fReason = name + " was lost in " + side.fName;
            }
        }
        if (declaration) {
            difference.fDeclaration = *declaration;
            difference.fDeclaration.fDescription.clear();
        }
        difference.fDeclaration.fName = name;
        difference.fFrom = from ? *from : TPropertyRecord{name, {}, ""};
        difference.fTo = to ? *to : TPropertyRecord{name, {}, ""};
        fResult.fDifferences.push_back(std::move(difference));
    }

    const TSide& fFrom;
    const TSide& fTo;
    TComparison fResult;
    std::set<std::string> fDoubts; // that were reported
};

} // namespace

TComparison Compare(const TSide& from, const TSide& to)
{
    return TComparer(from, to).Run();
}

bool TComparison::HasDifferences() const
{
    return std::any_of(fDifferences.begin(), fDifferences.end(),
                       [](const TDifference& each) { return each.fKind != EDifference::kUnknown; });
}

} // namespace vrxhost
