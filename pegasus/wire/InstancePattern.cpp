// SPDX-License-Identifier: MIT
#include "pegasus/wire/InstancePattern.h"

#include "pegasus/base/AsciiCase.h"
#include "pegasus/base/Text.h"
#include "pegasus/base/ValueText.h"
#include "pegasus/common/CIMValueRep.h"
#include "pegasus/wire/TextCursor.h"

#include <algorithm>
#include <unordered_map>
#include <unordered_set>

namespace Pegasus::wire {
namespace {

// Of all tags of a pattern: more than a class has, and little for a client to keep.
constexpr std::size_t kMaxPatternBytes = 64UL * 1024;

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

std::string foldedName(const CIMConstProperty& property)
{
    return base::foldCase(base::utf8(property.getName()));
}

// The attribute NAME of an element that was decoded.
String nameOf(const XmlElement& element)
{
    XmlAttribute values[1];
    element.attributes({"NAME"}, values);
    std::string scratch;
    return base::fromUtf8(element.resolved(*values[0], scratch));
}

bool isDateTime(std::string_view text)
{
    try {
        if (!text.empty()) {
            CIMDateTime(base::fromUtf8(text));
        }
        return true;
    } catch (const Exception&) {
        return false;
    }
}

} // namespace

// One element as it is compared with a pattern.
class InstanceMatch
{
  public:
    InstanceMatch(const InstancePattern& pattern, std::string_view text, const XmlLimits& limits, PackedWriter& values)
        : fPattern(pattern), fLimits(limits), fValues(values), fText(text)
    {
    }

    XmlOffer result()
    {
        if (takeElement()) {
            return {XmlOffer::Result::kTaken, fText.position()};
        }
        return {fText.isCut() ? XmlOffer::Result::kCut : XmlOffer::Result::kRefused};
    }

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

bool InstanceMatch::takeElement()
{
    if (!takeKeys()) {
        return false;
    }
    for (const InstancePattern::Property& property : fPattern.fProperties) {
        if (!fText.take(property.start)) {
            fValues.putState(PackedState::kAbsent);
        } else if (!takeRest(property)) {
            return false;
        }
    }
    if (!fText.take("</INSTANCE>")) {
        return false;
    }
    fText.skipBlanks();
    return fText.take("</VALUE.NAMEDINSTANCE>");
}

// Up to the first property.
bool InstanceMatch::takeKeys()
{
    const std::vector<std::string>& head = fPattern.fHead;
    for (std::size_t i = 0; i + 1 < head.size(); ++i) {
        std::string_view text;
        if (!fText.take(head[i]) || !fText.takeText(text, fLimits.maxTextBytes)) {
            return false;
        }
        fValues.putText(text);
    }
    return fText.take(head.back());
}

// After the beginning of the start tag.
bool InstanceMatch::takeRest(const InstancePattern::Property& property)
{
    if (fText.take("/>")) {
        fValues.putState(PackedState::kNull);
    } else if (!fText.take(">") || !takeContent(property) ||
               !fText.take(property.isArray ? "</PROPERTY.ARRAY>" : "</PROPERTY>"))
    {
        return false;
    }
    fText.skipBlanks();
    return true;
}

bool InstanceMatch::takeContent(const InstancePattern::Property& property)
{
    fText.skipBlanks();
    const bool hasValue = fText.take(property.isArray ? "<VALUE.ARRAY>" : "<VALUE>");
    fValues.putState(hasValue ? PackedState::kValue : PackedState::kNull);
    if (!hasValue) {
        return true;
    }
    const bool isTaken = visitType(property.type, [&](auto tag) {
        using T = typename decltype(tag)::Type;
        if constexpr (kIsPackable<T>) {
            return property.isArray ? takeArray<T>() : takeValue<T>();
        } else {
            return false;
        }
    });
    fText.skipBlanks();
    return isTaken;
}

template <typename T> bool InstanceMatch::takeArray()
{
    const std::size_t sizeAt = fValues.reserveSize();
    Uint32 size = 0;
    fText.skipBlanks();
    for (; fText.take("<VALUE>"); fText.skipBlanks()) {
        if (++size > fLimits.maxArrayElements || !takeValue<T>()) {
            return false;
        }
    }
    fValues.putSize(sizeAt, size);
    return fText.take("</VALUE.ARRAY>");
}

// After its start tag.
template <typename T> bool InstanceMatch::takeValue()
{
    std::string_view text;
    return fText.takeText(text, fLimits.maxTextBytes) && putElement<T>(text) && fText.take("</VALUE>");
}

template <typename T> bool InstanceMatch::putElement(std::string_view text)
{
    if constexpr (std::is_same_v<T, String>) {
        fValues.putText(text);
        return true;
    } else if constexpr (std::is_same_v<T, CIMDateTime>) {
        fValues.putText(text);
        return isDateTime(text);
    } else {
        const std::optional<T> value = base::parseValue<T>(text);
        fValues.put(value.value_or(T()));
        return value.has_value();
    }
}

XmlOffer InstancePattern::read(std::string_view text, const XmlLimits& limits, PackedWriter& values) const
{
    values.clear();
    return InstanceMatch(*this, text, limits, values).result();
}

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
    const Array<CIMKeyBinding> keys = path.getKeyBindings();
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
    fProperties.push_back({std::string(withoutEnd(element.startTag())), property.getType(), property.isArray()});
    CIMProperty declared = property.clone();
    declared.setValue(CIMValue(property.getType(), property.isArray(), property.getArraySize()));
    layout.fProperties.push_back(declared);
    return true;
}

std::size_t InstancePattern::bytes() const
{
    std::size_t sum = 0;
    for (const std::string& part : fHead) {
        sum += part.size();
    }
    for (const Property& property : fProperties) {
        sum += property.start.size();
    }
    return sum;
}

bool InstancePattern::add(const InstancePattern& other)
{
    std::unordered_map<std::string_view, std::size_t> places;
    std::unordered_set<std::string> names;
    for (std::size_t i = 0; i < fProperties.size(); ++i) {
        places.emplace(fProperties[i].start, i);
        names.insert(foldedName(fLayout->fProperties[i]));
    }
    InstancePattern merged;
    merged.fHead = fHead;
    const auto layout = std::make_shared<InstanceLayout>();
    layout->fClassName = fLayout->fClassName;
    layout->fKeys = fLayout->fKeys;
    const auto append = [&](const InstancePattern& from, std::size_t at) {
        merged.fProperties.push_back(from.fProperties[at]);
        layout->fProperties.push_back(from.fLayout->fProperties[at]);
    };
    std::size_t done = 0; // of our own properties
    for (std::size_t i = 0; i < other.fProperties.size(); ++i) {
        const auto place = places.find(other.fProperties[i].start);
        if (place == places.end()) {
            if (names.count(foldedName(other.fLayout->fProperties[i])) != 0) {
                return false; // the same property with another tag
            }
            append(other, i);
            continue;
        }
        if (place->second < done) {
            return false; // in another order
        }
        while (done <= place->second) {
            append(*this, done++);
        }
    }
    while (done < fProperties.size()) {
        append(*this, done++);
    }
    if (merged.bytes() > kMaxPatternBytes) {
        return false;
    }
    merged.fLayout = layout;
    *this = std::move(merged);
    return true;
}

} // namespace Pegasus::wire
