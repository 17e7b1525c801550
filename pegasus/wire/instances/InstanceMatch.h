// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/common/PackedInstance.h"
#include "pegasus/wire/XmlLimits.h"
#include "pegasus/wire/XmlSlicer.h"
#include "pegasus/wire/instances/InstancePattern.h"
#include "pegasus/wire/instances/TextCursor.h"

#include <string_view>

namespace Pegasus::wire {

// Reads one element by a pattern, up to its end tag, and writes its values. It refuses whatever may be an error:
// whoever reads the element then finds it, at its place. Thread: one thread at a time.
class InstanceMatch
{
  public:
    // The element begins the text. All of these must outlive the object.
    InstanceMatch(const InstancePattern& pattern, std::string_view text, const XmlLimits& limits, PackedWriter& values)
        : fPattern(pattern), fLimits(limits), fValues(values), fText(text, limits.maxTextBytes)
    {
    }

    XmlOffer result();

  private:
    bool takeElement();
    bool takeKeys();
    bool takeRest(const InstancePattern::Property& property);
    bool takeContent(const InstancePattern::Property& property);
    template <typename T> bool takeArray();
    template <typename T> bool takeValue();
    template <typename T> bool putElement(std::string_view text);

    const InstancePattern& fPattern;
    const XmlLimits& fLimits;
    PackedWriter& fValues;
    TextCursor fText;
};

} // namespace Pegasus::wire
