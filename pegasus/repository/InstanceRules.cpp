// SPDX-License-Identifier: MIT
#include "pegasus/repository/InstanceRules.h"

#include "pegasus/base/Text.h"
#include "pegasus/common/EmbeddedKind.h"
#include "pegasus/repository/CimError.h"
#include "pegasus/repository/ClassRules.h"

namespace Pegasus::repository {

namespace {

CIMConstProperty declaredProperty(const CIMConstClass& itsClass, const CIMName& name)
{
    const Uint32 index = itsClass.findProperty(name);
    if (index == PEG_NOT_FOUND) {
        fail(CIM_ERR_FAILED, "no such property: " + base::utf8(name));
    }
    return itsClass.getProperty(index);
}

CIMProperty propertyOf(const CIMConstProperty& declared, const CIMValue& value, bool isPropagated)
{
    return CIMProperty(declared.getName(), value, declared.getArraySize(), declared.getReferenceClassName(),
                       declared.getClassOrigin(), isPropagated);
}

bool isEmbedded(CIMType type)
{
    return type == CIMTYPE_OBJECT || type == CIMTYPE_INSTANCE;
}

// A property with embedded objects also accepts what the decoder makes of them, and the null of a client that sent it
// with another type.
bool isStorableAs(const CIMConstProperty& given, const CIMConstProperty& declared)
{
    if (given.isArray() != declared.isArray()) {
        return false;
    }
    if (given.getType() == declared.getType()) {
        return true;
    }
    const bool holdsEmbedded = embeddedKind(declared) != EmbeddedKind::kNone;
    return holdsEmbedded && (isEmbedded(given.getType()) || given.getValue().isNull());
}

CIMProperty givenProperty(const CIMConstProperty& given, const CIMConstClass& itsClass)
{
    const CIMConstProperty declared = declaredProperty(itsClass, given.getName());
    if (!isStorableAs(given, declared)) {
        fail(CIM_ERR_FAILED, "type mismatch");
    }
    return propertyOf(declared, given.getValue(), false);
}

// Datetimes and char16 are strings in a path, so a null of them is an empty key like a null string.
CIMKeyBinding keyBinding(const CIMConstProperty& property)
{
    const CIMValue& value = property.getValue();
    const CIMType type = value.getType();
    const bool isText = type == CIMTYPE_STRING || type == CIMTYPE_CHAR16 || type == CIMTYPE_DATETIME;
    if (value.isNull() && !isText) {
        fail(CIM_ERR_INVALID_PARAMETER, "key property " + base::utf8(property.getName()) + " is null");
    }
    if (value.isNull()) {
        return CIMKeyBinding(property.getName(), String(), CIMKeyBinding::STRING);
    }
    return CIMKeyBinding(property.getName(), value);
}

} // namespace

CIMInstance completeInstance(const CIMConstInstance& given, const CIMConstClass& itsClass)
{
    if (itsClass.isAbstract()) {
        fail(CIM_ERR_NOT_SUPPORTED, "abstract class cannot have instances: " + base::utf8(itsClass.getClassName()));
    }
    CIMInstance completed(itsClass.getClassName());
    for (Uint32 i = 0; i < itsClass.getPropertyCount(); ++i) {
        const CIMConstProperty declared = itsClass.getProperty(i);
        if (given.findProperty(declared.getName()) == PEG_NOT_FOUND) {
            completed.addProperty(propertyOf(declared, declared.getValue(), true));
        }
    }
    for (Uint32 i = 0; i < given.getPropertyCount(); ++i) {
        completed.addProperty(givenProperty(given.getProperty(i), itsClass));
    }
    return completed;
}

CIMObjectPath instancePath(const CIMConstInstance& completed, const CIMConstClass& itsClass)
{
    Array<CIMName> keyNames;
    itsClass.getKeyNames(keyNames);
    if (keyNames.size() == 0) {
        fail(CIM_ERR_FAILED, "class has no keys: " + base::utf8(itsClass.getClassName()));
    }
    Array<CIMKeyBinding> keys;
    for (Uint32 i = 0; i < keyNames.size(); ++i) {
        keys.append(keyBinding(completed.getProperty(completed.findProperty(keyNames[i]))));
    }
    return CIMObjectPath(String(), CIMNamespaceName(), itsClass.getClassName(), keys);
}

CIMInstance mergedInstance(const CIMInstance& stored, const CIMConstInstance& modified, const CIMConstClass& itsClass,
                           const CIMPropertyList& list)
{
    CIMInstance changes(itsClass.getClassName());
    for (Uint32 i = 0; i < modified.getPropertyCount(); ++i) {
        const CIMConstProperty property = modified.getProperty(i);
        if (isListed(list, property.getName())) {
            changes.addProperty(givenProperty(property, itsClass));
        }
    }
    CIMInstance merged(itsClass.getClassName());
    for (Uint32 i = 0; i < stored.getPropertyCount(); ++i) {
        const CIMConstProperty kept = stored.getProperty(i);
        const Uint32 changed = changes.findProperty(kept.getName());
        merged.addProperty(changed == PEG_NOT_FOUND ? kept.clone() : changes.getProperty(changed));
    }
    return merged;
}

CIMInstance filteredInstance(CIMInstance stored, const CIMConstClass& shape, const InstanceOptions& options)
{
    CIMInstance filtered(stored.getClassName());
    filtered.setPath(stored.getPath());
    const bool isWhole = shape.isUninitialized();
    const Uint32 count = isWhole ? stored.getPropertyCount() : shape.getPropertyCount();
    for (Uint32 i = 0; i < count; ++i) {
        const Uint32 index = isWhole ? i : stored.findProperty(shape.getProperty(i).getName());
        if (index == PEG_NOT_FOUND || !isListed(options.propertyList, stored.getProperty(index).getName())) {
            continue;
        }
        CIMProperty property = stored.getProperty(index);
        if (!options.includeClassOrigin) {
            property.setClassOrigin(CIMName());
        }
        filtered.addProperty(property);
    }
    return filtered;
}

} // namespace Pegasus::repository
