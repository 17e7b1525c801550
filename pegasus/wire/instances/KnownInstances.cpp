// SPDX-License-Identifier: MIT
#include "pegasus/wire/instances/KnownInstances.h"

#include "pegasus/common/ObjectReps.h"
#include "pegasus/wire/instances/InstanceMatch.h"

#include <algorithm>

namespace Pegasus::wire {
namespace {

// Answers with instances of several classes have them in turns at worst.
constexpr std::size_t kMaxPatterns = 8;

// Learning takes time with the number of properties that are known. An answer may have so many instances that are
// learned, and one more for each so many that are taken.
constexpr std::size_t kTrials = 16;

// What an instance counts beside its values: its two pieces of memory; for each object that it gets when it is asked
// for its properties, a part of what that takes. All objects of an instance take at most four times what it counts.
constexpr std::size_t kAllocationBytes = 16;
constexpr std::size_t kMemberBytes = 32;
constexpr std::size_t kTextBytes = 16;

} // namespace

// Beyond its share an answer is learned from ever less: a class that comes late should be known at last.
bool KnownInstances::mayLearn() const
{
    const bool isPowerOfTwo = (fRead & (fRead - 1)) == 0;
    return fLearned < kTrials + fTaken / kTrials || isPowerOfTwo;
}

void KnownInstances::learn(const XmlElement& element, const CIMInstance& instance)
{
    ++fRead;
    if (!mayLearn()) {
        return;
    }
    ++fLearned;
    std::optional<InstancePattern> pattern = InstancePattern::of(element, instance, fLimits);
    if (!pattern) {
        return;
    }
    const auto known = std::find_if(fPatterns.begin(), fPatterns.end(),
                                    [&](const InstancePattern& old) { return old.hasHeadOf(*pattern); });
    if (known != fPatterns.end() && known->add(*pattern)) {
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
        fValues.clear();
        const XmlOffer offer = InstanceMatch(*known, text, fLimits, fValues).result();
        if (offer.result == XmlOffer::Result::kTaken) {
            instance = packed(known->layout());
            ++fTaken;
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
    const std::size_t members = 1 + layout->fKeys.size() + layout->fProperties.size(); // the path is one
    fBytes = sizeof(CIMInstance) + sizeof(CIMInstanceRep) + sizeof(PackedInstance) + 2 * kAllocationBytes +
             values.size() + members * kMemberBytes + fValues.texts() * kTextBytes;
    return ObjectAccess::wrap<CIMInstance>(new CIMInstanceRep(PackedInstance::create(layout, values)));
}

} // namespace Pegasus::wire
