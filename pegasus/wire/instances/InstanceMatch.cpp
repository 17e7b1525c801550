// SPDX-License-Identifier: MIT
#include "pegasus/wire/instances/InstanceMatch.h"

#include "pegasus/base/Text.h"
#include "pegasus/base/ValueText.h"
#include "pegasus/common/CIMValueRep.h"

#include <optional>
#include <string>
#include <vector>

namespace Pegasus::wire {
namespace {

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

XmlOffer InstanceMatch::result()
{
    if (takeElement()) {
        return {XmlOffer::Result::kTaken, fText.position()};
    }
    return {fText.isCut() ? XmlOffer::Result::kCut : XmlOffer::Result::kRefused};
}

bool InstanceMatch::takeElement()
{
    if (!takeKeys()) {
        return false;
    }
    for (const InstancePattern::Property& property : fPattern.properties()) {
        if (!fText.take(property.start)) {
            fValues.putState(PackedState::kAbsent);
        } else if (!property.learned.empty() && fText.take(property.learned)) {
            fValues.putState(PackedState::kShared);
            fText.skipBlanks();
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
    const std::vector<std::string>& head = fPattern.head();
    for (std::size_t i = 0; i + 1 < head.size(); ++i) {
        std::string_view text;
        if (!fText.take(head[i]) || !fText.takeText(text)) {
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
    return fText.takeText(text) && putElement<T>(text) && fText.take("</VALUE>");
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

} // namespace Pegasus::wire
