// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/wire/XmlSlicer.h"
#include "pegasus/wire/instances/InstancePattern.h"

#include <cstddef>
#include <memory>
#include <string_view>
#include <vector>

namespace Pegasus::wire {

// Reads the instances of an answer whose tags are those of an earlier one. It keeps a few patterns, the last used one
// first, because the instances of one class follow each other.
// Thread: one thread at a time.
class KnownInstances
{
  public:
    explicit KnownInstances(const XmlLimits& limits = XmlLimits()) : fLimits(limits) {}

    // Between two answers.
    void beginAnswer() { fTaken = fRead = fLearned = 0; }
    // Notes the tags of a VALUE.NAMEDINSTANCE that was decoded into this instance.
    void learn(const XmlElement& element, const CIMInstance& instance);
    // Takes an element that begins the text if a pattern fits. Returns: what became of it; a taken one is in `instance`
    // and in bytes().
    XmlOffer take(std::string_view text, CIMInstance& instance);
    // Returns: what the last taken instance counts: the bytes of memory that it has, the allocator's share included,
    // and some for the objects that it may get.
    std::size_t bytes() const { return fBytes; }

  private:
    bool mayLearn() const;
    CIMInstance packed(const std::shared_ptr<const InstanceLayout>& layout);

    const XmlLimits fLimits;
    std::vector<InstancePattern> fPatterns;
    PackedWriter fValues;
    // Instances of the answer.
    std::size_t fTaken = 0;
    std::size_t fRead = 0; // by others, and offered to learn()
    std::size_t fLearned = 0;
    std::size_t fBytes = 0;
};

} // namespace Pegasus::wire
