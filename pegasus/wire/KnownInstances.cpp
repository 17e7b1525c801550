// SPDX-License-Identifier: MIT
#include "pegasus/wire/KnownInstances.h"

#include "pegasus/common/ObjectReps.h"

#include <algorithm>

namespace Pegasus::wire {
namespace {

// Answers with instances of several classes have them in turns at worst.
constexpr std::size_t kMaxPatterns = 8;

constexpr std::size_t kAllocationBytes = 16;
// What a property counts beside its value. With its objects it takes at most five times what it counts.
constexpr std::size_t kPropertyReserve = 32;

} // namespace

void KnownInstances::learn(const XmlElement& element, const CIMInstance& instance)
{
    std::optional<InstancePattern> pattern = InstancePattern::of(element, instance, fLimits);
    const auto isSame = [&pattern](const InstancePattern& known) { return known.hasTagsOf(*pattern); };
    if (!pattern || std::any_of(fPatterns.begin(), fPatterns.end(), isSame)) {
        return;
    }
    if (fPatterns.size() == kMaxPatterns) {
        fPatterns.pop_back();
    }
    fPatterns.insert(fPatterns.begin(), std::move(*pattern));
}

XmlOffer KnownInstances::take(std::string_view text, CIMInstance& instance)
{
    for (auto known = fPatterns.begin(); known != fPatterns.end(); ++known) {
        const XmlOffer offer = known->read(text, fLimits, fValues);
        if (offer.result == XmlOffer::Result::kTaken) {
            instance = packed(known->layout());
            std::rotate(fPatterns.begin(), known, known + 1);
            return offer;
        }
        if (offer.result == XmlOffer::Result::kCut) {
            return offer;
        }
    }
    return {};
}

CIMInstance KnownInstances::packed(const std::shared_ptr<const InstanceLayout>& layout)
{
    const std::string_view values = fValues.bytes();
    fBytes = sizeof(CIMInstance) + sizeof(CIMInstanceRep) + sizeof(PackedInstance) + values.size() +
             2 * kAllocationBytes + layout->fProperties.size() * kPropertyReserve;
    return ObjectAccess::wrap<CIMInstance>(new CIMInstanceRep(PackedInstance::create(layout, values)));
}

} // namespace Pegasus::wire
