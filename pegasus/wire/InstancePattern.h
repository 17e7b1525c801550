// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/common/PackedInstance.h"
#include "pegasus/wire/XmlElement.h"
#include "pegasus/wire/XmlSlicer.h"

#include <Pegasus/Common/CIMInstance.h>

#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace Pegasus::wire {

// The tags of a VALUE.NAMEDINSTANCE that was read and decoded. The instances of an answer differ in their values,
// seldom in their tags: another element with the same bytes for tags needs neither reading nor checking, but for its
// values.
//
// A pattern has keys with values and properties of packable types. It knows the elements below, with blanks between
// them; each name with a "k" stands for known bytes:
//
//   element  = kHead (text kHead)* property+ "</INSTANCE>" "</VALUE.NAMEDINSTANCE>"
//   property = kStart ( "/>" | ">" value? "</PROPERTY>" ) | kStart ( "/>" | ">" array? "</PROPERTY.ARRAY>" )
//   value    = "<VALUE>" text "</VALUE>"
//   array    = "<VALUE.ARRAY>" value* "</VALUE.ARRAY>"
//
// Thread: any; it stays as it was made.
class InstancePattern
{
  public:
    // Returns: nullopt for an element that has something else, or very long tags.
    // Requires: the instance was decoded from the element.
    static std::optional<InstancePattern> of(const XmlElement& element, const CIMInstance& instance,
                                             const XmlLimits& limits);

    bool hasHeadOf(const InstancePattern& other) const { return fHead == other.fHead; }
    // Adds the properties that it lacks. Returns: false when it stays as it is, because order or names contradict, or
    // the tags become very long. Requires: hasHeadOf(other).
    bool add(const InstancePattern& other);
    const std::shared_ptr<const InstanceLayout>& layout() const { return fLayout; }

    // Reads the element that begins the text, up to its end tag, and writes its values. It refuses whatever may be an
    // error: whoever reads the element then finds it, at its place.
    XmlOffer read(std::string_view text, const XmlLimits& limits, PackedWriter& values) const;

  private:
    friend class InstanceMatch;

    struct Property
    {
        std::string start; // its start tag without ">" or "/>"
        CIMType type;
        bool isArray;
    };

    bool learn(const XmlElement& element, const CIMInstance& instance, InstanceLayout& layout);
    bool learnKeys(const XmlElement& instanceName, const CIMObjectPath& path, const char*& from,
                   InstanceLayout& layout);
    bool learnProperty(const XmlElement& element, const CIMConstProperty& property, InstanceLayout& layout);
    std::size_t bytes() const;

    std::vector<std::string> fHead; // the bytes before, between and after the texts of the keys
    std::vector<Property> fProperties;
    std::shared_ptr<const InstanceLayout> fLayout;
};

} // namespace Pegasus::wire
