// SPDX-License-Identifier: MIT
// How a pattern is made of an element and of what it was decoded into.
#include "pegasus/base/Text.h"
#include "pegasus/common/CIMValueRep.h"
#include "pegasus/wire/instances/InstancePattern.h"

#include <algorithm>
#include <optional>

namespace Pegasus::wire {
namespace {

// Of a property's value: with longer ones instances seldom agree.
constexpr std::size_t kMaxLearnedBytes = 256;

bool isEmptyTag(std::string_view tag)
{
    return tag.substr(tag.size() - 2) == "/>";
}

std::string_view withoutEnd(std::string_view tag)
{
    return tag.substr(0, tag.size() - (isEmptyTag(tag) ? 2 : 1));
}

std::string between(const char* from, const char* to)
{
    return std::string(from, static_cast<std::size_t>(to - from));
}

// Requires: it has a start tag and an end tag.
std::string learnedValue(const XmlElement& element)
{
    std::string bytes = ">";
    bytes.append(element.content()).append("</").append(element.name());
    return bytes += '>';
}

bool isPackable(const CIMConstProperty& property)
{
    const bool isPackableType =
        visitType(property.getType(), [](auto tag) { return kIsPackable<typename decltype(tag)::Type>; });
    return isPackableType && property.getQualifierCount() == 0;
}

// Returns: the place of the one key of this name; nullopt when there is another number of them.
std::optional<Uint32> placeOf(const Array<CIMKeyBinding>& keys, const String& name)
{
    const auto isIt = [&name](const CIMKeyBinding& key) { return key.getName().getString() == name; };
    const CIMKeyBinding* const end = keys.getData() + keys.size();
    const CIMKeyBinding* const found = std::find_if(keys.getData(), end, isIt);
    const bool isOne = found != end && std::none_of(found + 1, end, isIt);
    return isOne ? std::optional<Uint32>(static_cast<Uint32>(found - keys.getData())) : std::nullopt;
}

// The attribute NAME of an element that was decoded.
String nameOf(const XmlElement& element)
{
    XmlAttribute values[1];
    element.attributes({"NAME"}, values);
    std::string scratch;
    return base::fromUtf8(element.resolved(*values[0], scratch));
}

} // namespace

std::optional<InstancePattern> InstancePattern::of(const XmlElement& element, const CIMInstance& instance,
                                                   const XmlLimits& limits)
{
    InstancePattern pattern;
    const auto layout = std::make_shared<InstanceLayout>();
    if (!pattern.learn(element, instance, *layout) || pattern.bytes() > std::min(kMaxPatternBytes, limits.maxTagBytes))
    {
        return std::nullopt;
    }
    pattern.fLayout = layout;
    return pattern;
}

bool InstancePattern::learn(const XmlElement& element, const CIMInstance& instance, InstanceLayout& layout)
{
    const char* from = element.startTag().data();
    const XmlElement instanceName = element.firstChild();
    XmlElement child = instanceName.nextSibling().firstChild();
    if (!child || !learnKeys(instanceName, instance.getPath(), from, layout)) {
        return false;
    }
    fHead.push_back(between(from, child.startTag().data()));
    for (Uint32 i = 0; child; child = child.nextSibling(), ++i) {
        const bool isProperty = child.is("PROPERTY") || child.is("PROPERTY.ARRAY");
        if (!isProperty || !learnProperty(child, instance.getProperty(i), layout)) {
            return false;
        }
    }
    return true;
}

// `from` is where the element begins, and moves after the text of the last key.
bool InstancePattern::learnKeys(const XmlElement& instanceName, const CIMObjectPath& path, const char*& from,
                                InstanceLayout& layout)
{
    layout.fClassName = path.getClassName();
    const Array<CIMKeyBinding>& keys = path.getKeyBindings();
    for (XmlElement child = instanceName.firstChild(); child; child = child.nextSibling()) {
        const XmlElement value = child.firstChild();
        if (!child.is("KEYBINDING") || !value.is("KEYVALUE") || isEmptyTag(value.startTag())) {
            return false;
        }
        const std::optional<Uint32> place = placeOf(keys, nameOf(child));
        if (!place) {
            return false;
        }
        layout.fKeys.push_back({keys[*place].getName(), keys[*place].getType()});
        const std::string_view text = value.content();
        fHead.push_back(between(from, text.data()));
        from = text.data() + text.size();
    }
    return true;
}

bool InstancePattern::learnProperty(const XmlElement& element, const CIMConstProperty& property, InstanceLayout& layout)
{
    if (!isPackable(property)) {
        return false;
    }
    const std::string_view tag = element.startTag();
    fProperties.push_back({std::string(withoutEnd(tag)), property.getType(), property.isArray(), {}});
    CIMProperty declared = property.clone();
    if (!isEmptyTag(tag) && element.content().size() <= kMaxLearnedBytes) {
        fProperties.back().learned = learnedValue(element);
    } else {
        declared.setValue(CIMValue(property.getType(), property.isArray(), property.getArraySize()));
    }
    layout.fProperties.push_back(declared);
    return true;
}

} // namespace Pegasus::wire
