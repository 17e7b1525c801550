#include "pegasus/cmpi/services/ClassSchema.h"

#include "pegasus/cmpi/services/ProviderText.h"

#include <Pegasus/Common/CIMProperty.h>
#include <Pegasus/Common/CIMQualifier.h>

namespace Pegasus::cmpi {
namespace {

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

// On the wire an embedded type is an attribute of the property, or a qualifier alone.
bool isEmbeddedObject(const CIMConstProperty& property)
{
    return property.getType() == CIMTYPE_OBJECT ||
           (property.getType() == CIMTYPE_STRING && isTrue(property, "EmbeddedObject"));
}

bool isEmbeddedInstance(const CIMConstProperty& property)
{
    return property.getType() == CIMTYPE_INSTANCE ||
           (property.getType() == CIMTYPE_STRING &&
            property.findQualifier(CIMName("EmbeddedInstance")) != PEG_NOT_FOUND);
}

std::size_t hashOf(std::string_view name)
{
    std::size_t hash = 14695981039346656037U; // FNV-1a over the letters without their case
    for (const char c : name) {
        hash = (hash ^ (static_cast<unsigned char>(c) | 0x20U)) * 1099511628211U;
    }
    return hash;
}

} // namespace

ClassSchema::ClassSchema(const CIMClass& source)
    : fName(source.getClassName()), fText(utf8(fName)), fSuperClass(source.getSuperClassName())
{
    fProperties.reserve(source.getPropertyCount());
    for (Uint32 i = 0; i < source.getPropertyCount(); ++i) {
        addProperty(source.getProperty(i));
    }
    index();
}

void ClassSchema::addProperty(const CIMConstProperty& property)
{
    PropertySchema added;
    added.name = property.getName();
    added.text = utf8(added.name);
    added.type = property.getType();
    added.isArray = property.isArray();
    added.isKey = isTrue(property, "Key");
    added.isEmbeddedObject = isEmbeddedObject(property);
    added.isEmbedded = added.isEmbeddedObject || isEmbeddedInstance(property);
    added.referenceClass = property.getReferenceClassName();
    added.initial = property.getValue();
    if (added.isKey) {
        fKeys.push_back(fProperties.size());
    }
    fProperties.push_back(std::move(added));
}

void ClassSchema::index()
{
    std::size_t size = 4;
    while (size < fProperties.size() * 2) {
        size *= 2;
    }
    fBuckets.assign(size, 0);
    for (std::size_t i = 0; i < fProperties.size(); ++i) {
        std::size_t at = hashOf(fProperties[i].text) & (size - 1);
        while (fBuckets[at] != 0) {
            at = (at + 1) & (size - 1);
        }
        fBuckets[at] = static_cast<std::uint32_t>(i + 1);
    }
}

std::size_t ClassSchema::find(std::string_view name) const
{
    const std::size_t mask = fBuckets.size() - 1;
    for (std::size_t at = hashOf(name) & mask; fBuckets[at] != 0; at = (at + 1) & mask) {
        if (sameName(fProperties[fBuckets[at] - 1].text, name)) {
            return fBuckets[at] - 1;
        }
    }
    return kNotFound;
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
