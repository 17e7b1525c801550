// SPDX-License-Identifier: MIT
#include "pegasus/cmpi/services/ClassSchema.h"

#include "pegasus/base/AsciiCase.h"
#include "pegasus/base/Text.h"
#include "pegasus/wire/ElementEncoder.h"

#include <Pegasus/Common/CIMObjectPath.h>
#include <Pegasus/Common/CIMProperty.h>
#include <Pegasus/Common/CIMQualifier.h>

#include <cstring>

namespace Pegasus::cmpi {
namespace {

CIMKeyBinding::Type keyKind(CIMType type)
{
    return type == CIMTYPE_BOOLEAN                                                        ? CIMKeyBinding::BOOLEAN
           : type == CIMTYPE_STRING || type == CIMTYPE_DATETIME || type == CIMTYPE_CHAR16 ? CIMKeyBinding::STRING
                                                                                          : CIMKeyBinding::NUMERIC;
}

bool isTrue(const CIMConstProperty& property, const char* qualifier)
{
    const Uint32 at = property.findQualifier(CIMName(qualifier));
    if (at == PEG_NOT_FOUND) {
        return false;
    }
    const CIMValue value = property.getQualifier(at).getValue();
    Boolean result = false;
    if (!value.isNull() && value.getType() == CIMTYPE_BOOLEAN && !value.isArray()) {
        value.get(result);
    }
    return result;
}

} // namespace

std::size_t ClassSchema::NoCaseHash::operator()(std::string_view name) const noexcept
{
    std::size_t hash = 14695981039346656037U; // FNV-1a over the letters without their case
    for (const char c : name) {
        hash = (hash ^ static_cast<unsigned char>(base::lowerAscii(c))) * 1099511628211U;
    }
    return hash;
}

ClassSchema::ClassSchema(const CIMClass& source)
    : fName(source.getClassName()), fText(base::utf8(fName)), fSuperClass(source.getSuperClassName()),
      fFollowers(source.getPropertyCount() + 1)
{
    wire::appendInstanceNameStart(fNameStart, fName);
    wire::appendInstanceStart(fInstanceStart, fName);
    fProperties.reserve(source.getPropertyCount());
    for (Uint32 i = 0; i < source.getPropertyCount(); ++i) {
        addProperty(source.getProperty(i));
    }
    for (std::size_t i = 0; i < fProperties.size(); ++i) {
        fIndices.emplace(fProperties[i].text, i);
    }
}

void ClassSchema::addProperty(const CIMConstProperty& property)
{
    PropertySchema added;
    added.name = property.getName();
    added.text = base::utf8(added.name);
    added.type = property.getType();
    added.isArray = property.isArray();
    added.isKey = isTrue(property, "Key");
    added.isInherited = property.getPropagated();
    added.embedded = embeddedKind(property);
    added.referenceClass = property.getReferenceClassName();
    added.initial = property.getValue();
    const bool isPlain = !added.isArray && added.type != CIMTYPE_REFERENCE && added.embedded == EmbeddedKind::kNone;
    if (isPlain) {
        CIMProperty bare(added.name, CIMValue(added.type, false));
        bare.setPropagated(added.isInherited);
        wire::appendPropertyStart(added.start, bare);
        bare.setValue(added.initial);
        wire::appendProperty(added.unset, bare, wire::Blanks::kRaw);
    }
    if (isPlain && added.isKey) {
        wire::appendKeyStart(added.keyStart, added.name, keyKind(added.type));
    }
    if (added.isKey) {
        fKeys.push_back(fProperties.size());
    }
    fProperties.push_back(std::move(added));
}

std::size_t ClassSchema::find(std::string_view name) const
{
    const auto found = fIndices.find(name);
    return found == fIndices.end() ? kNotFound : found->second;
}

std::size_t ClassSchema::findAfter(std::size_t last, const char* name) const
{
    std::atomic<std::uint32_t>& follower = fFollowers[last + 1]; // kNotFound is -1
    const std::size_t guess = follower.load(std::memory_order_relaxed);
    if (guess < fProperties.size() && std::strcmp(fProperties[guess].text.c_str(), name) == 0) {
        return guess;
    }
    const std::size_t found = find(name);
    if (found != kNotFound) {
        follower.store(static_cast<std::uint32_t>(found), std::memory_order_relaxed);
    }
    return found;
}

std::size_t ClassSchema::findKey(const CIMName& name) const
{
    for (const std::size_t key : fKeys) {
        if (fProperties[key].name.equal(name)) {
            return key;
        }
    }
    return kNotFound;
}

} // namespace Pegasus::cmpi
