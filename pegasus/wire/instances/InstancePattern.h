// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/common/PackedInstance.h"
#include "pegasus/wire/XmlElement.h"
#include "pegasus/wire/XmlLimits.h"

#include <Pegasus/Common/CIMInstance.h>

#include <cstddef>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace Pegasus::wire {

// The tags of a VALUE.NAMEDINSTANCE that was read and decoded, and of others of its class. The instances of an answer
// differ in their values, seldom in their tags: an element with known tags needs no reading, and of all checks those of
// its values alone. Many properties have the same value in all of them: one with the bytes of the learned instance
// needs no check, and shares the value of the layout.
//
// A pattern has keys with values, and properties of packable types. It knows the elements below, with blanks between
// them. "head" and "start" stand for known bytes. The properties have an order, and each of them may be missing:
//
//   element  = head (text head)* property* "</INSTANCE>" "</VALUE.NAMEDINSTANCE>"
//   property = start ( "/>" | ">" value? "</PROPERTY>" ) | start ( "/>" | ">" array? "</PROPERTY.ARRAY>" )
//   value    = "<VALUE>" text "</VALUE>"
//   array    = "<VALUE.ARRAY>" value* "</VALUE.ARRAY>"
//
// Thread: one thread at a time.
class InstancePattern
{
  public:
    struct Property
    {
        std::string start; // its start tag without ">" or "/>"
        CIMType type;
        bool isArray;
        std::string learned; // what followed the start where it was learned, with the end tag; empty when that was long
    };

    // Returns: nullopt for an element that has something else, or very long tags.
    // Requires: the instance was decoded from the element.
    static std::optional<InstancePattern> of(const XmlElement& element, const CIMInstance& instance,
                                             const XmlLimits& limits);

    bool hasHeadOf(const InstancePattern& other) const { return fHead == other.fHead; }
    // Adds the properties that it lacks. Returns: false when it stays as it is, because order or names contradict, or
    // the tags become very long. Requires: hasHeadOf(other).
    bool add(const InstancePattern& other);
    const std::shared_ptr<const InstanceLayout>& layout() const { return fLayout; }

    // The bytes before, between and after the texts of the keys.
    const std::vector<std::string>& head() const { return fHead; }
    const std::vector<Property>& properties() const { return fProperties; }

  private:
    bool learn(const XmlElement& element, const CIMInstance& instance, InstanceLayout& layout);
    bool learnKeys(const XmlElement& instanceName, const CIMObjectPath& path, const char*& from,
                   InstanceLayout& layout);
    bool learnProperty(const XmlElement& element, const CIMConstProperty& property, InstanceLayout& layout);
    std::size_t bytes() const;

    // Of all tags of a pattern: those of some 200 properties. Each instance is compared with all of them.
    static constexpr std::size_t kMaxPatternBytes = 16UL * 1024;

    std::vector<std::string> fHead;
    std::vector<Property> fProperties;
    std::shared_ptr<const InstanceLayout> fLayout;
};

} // namespace Pegasus::wire
