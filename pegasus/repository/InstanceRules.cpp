// SPDX-License-Identifier: MIT
#include "pegasus/repository/InstanceRules.h"

#include "pegasus/base/Text.h"
#include "pegasus/common/EmbeddedKind.h"
#include "pegasus/repository/CimError.h"

#include <algorithm>
#include <utility>

namespace Pegasus::repository {

namespace {

// Instances are filled by append(), which leaves out addProperty()'s search for an equal name: each name is a name of
// the class, and is taken once.

template <typename Handle> const Array<CIMProperty>& propertiesOf(const Handle& handle)
{
    return ObjectAccess::rep(handle).fProperties;
}

Array<CIMProperty>& listOf(CIMInstance& made)
{
    return ObjectAccess::rep(made).fProperties;
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

CIMProperty givenProperty(const CIMProperty& given, const Array<CIMProperty>& ofClass,
                          const NameIndex<CIMProperty>& byName)
{
    const Uint32 index = byName.find(given.getName());
    if (index == PEG_NOT_FOUND) {
        fail(CIM_ERR_FAILED, "no such property: " + base::utf8(given.getName()));
    }
    const CIMProperty& declared = ofClass[index];
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
    const Array<CIMProperty>& ofClass = propertiesOf(itsClass);
    const Array<CIMProperty>& ofGiven = propertiesOf(given);
    const NameIndex<CIMProperty> declared(ofClass);
    const NameIndex<CIMProperty> present(ofGiven);
    CIMInstance completed(itsClass.getClassName());
    Array<CIMProperty>& list = listOf(completed);
    for (Uint32 i = 0; i < ofClass.size(); ++i) {
        if (!present.has(ofClass[i].getName())) {
            list.append(propertyOf(ofClass[i], ofClass[i].getValue(), true));
        }
    }
    for (Uint32 i = 0; i < ofGiven.size(); ++i) {
        list.append(givenProperty(ofGiven[i], ofClass, declared));
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
    const NameIndex<CIMName> isKey(keyNames);
    const Array<CIMProperty>& properties = propertiesOf(completed);
    Array<CIMKeyBinding> keys;
    for (Uint32 i = 0; i < properties.size() && keys.size() < keyNames.size(); ++i) {
        if (isKey.has(properties[i].getName())) {
            keys.append(keyBinding(properties[i]));
        }
    }
    if (keys.size() != keyNames.size()) {
        fail(CIM_ERR_FAILED, "stored instance lacks a key: " + base::utf8(itsClass.getClassName()));
    }
    return CIMObjectPath(String(), CIMNamespaceName(), itsClass.getClassName(), keys);
}

CIMInstance mergedInstance(const CIMInstance& stored, const CIMConstInstance& modified, const CIMConstClass& itsClass,
                           const ListedNames& listed)
{
    const Array<CIMProperty>& ofClass = propertiesOf(itsClass);
    const Array<CIMProperty>& given = propertiesOf(modified);
    const NameIndex<CIMProperty> declared(ofClass);
    Array<CIMProperty> changes;
    for (Uint32 i = 0; i < given.size(); ++i) {
        if (listed.has(given[i].getName())) {
            changes.append(givenProperty(given[i], ofClass, declared));
        }
    }
    const NameIndex<CIMProperty> changed(changes);
    const Array<CIMProperty>& kept = propertiesOf(stored);
    CIMInstance merged(itsClass.getClassName());
    Array<CIMProperty>& list = listOf(merged);
    for (Uint32 i = 0; i < kept.size(); ++i) {
        const Uint32 index = changed.find(kept[i].getName());
        list.append(index == PEG_NOT_FOUND ? kept[i] : std::as_const(changes)[index]);
    }
    return merged;
}

CIMInstance filteredInstance(CIMInstance stored, const CIMConstClass& shape, const ListedNames& listed,
                             bool includeClassOrigin)
{
    const Array<CIMProperty>& all = propertiesOf(stored);
    CIMInstance filtered(stored.getClassName());
    filtered.setPath(stored.getPath());
    Array<CIMProperty>& list = listOf(filtered);
    const auto pick = [&](CIMProperty property) {
        if (!listed.has(property.getName())) {
            return;
        }
        if (!includeClassOrigin) {
            property.setClassOrigin(CIMName());
        }
        list.append(property);
    };
    if (shape.isUninitialized()) {
        std::for_each(all.getData(), all.getData() + all.size(), pick);
        return filtered;
    }
    const NameIndex<CIMProperty> byName(all);
    const Array<CIMProperty>& ofShape = propertiesOf(shape);
    for (Uint32 i = 0; i < ofShape.size(); ++i) {
        const Uint32 index = byName.find(ofShape[i].getName());
        if (index != PEG_NOT_FOUND) {
            pick(all[index]);
        }
    }
    return filtered;
}

} // namespace Pegasus::repository
