// SPDX-License-Identifier: MIT
#include "pegasus/cmpi/objects/InstanceObject.h"

#include "pegasus/base/AsciiCase.h"
#include "pegasus/base/Text.h"
#include "pegasus/cmpi/objects/Broker.h"
#include "pegasus/cmpi/objects/Habits.h"
#include "pegasus/cmpi/objects/KeyCodec.h"
#include "pegasus/cmpi/objects/NamedValues.h"
#include "pegasus/cmpi/services/DeclaredProperty.h"
#include "pegasus/cmpi/services/PropertyFilter.h"
#include "pegasus/common/ObjectReps.h"

#include <Pegasus/Common/CIMProperty.h>

#include <algorithm>
#include <utility>

namespace Pegasus::cmpi {
namespace {

CIMObjectPath placed(const CIMInstance& instance, const CIMNamespaceName& nameSpace)
{
    CIMObjectPath path = instance.getPath();
    path.setClassName(instance.getClassName());
    if (!nameSpace.isNull()) {
        path.setNameSpace(nameSpace);
    }
    return path;
}

// The bit in fPathKeys of a key property; none for other properties, and for keys beyond the 32nd.
std::uint32_t keyBit(const ClassSchema& schema, std::size_t property)
{
    const std::vector<std::size_t>& keys = schema.keys();
    const auto at = std::find(keys.begin(), keys.end(), property) - keys.begin();
    return at < std::min<std::ptrdiff_t>(32, keys.end() - keys.begin()) ? 1U << at : 0U;
}

} // namespace

InstanceObject::InstanceObject(Broker& owner, const PathState& path)
    : CMPIInstance{nullptr, &kInstanceTable}, broker(owner), fPath(path),
      fValues(Frame::current().takeValues(path.schema != nullptr ? path.schema->properties().size() : 0)),
      fLastSet(ClassSchema::kNotFound)
{
    hdl = this;
    takeKeys();
}

InstanceObject::InstanceObject(Broker& owner, const CIMInstance& instance, const CIMNamespaceName& nameSpace)
    : InstanceObject(owner, PathState(owner, placed(instance, nameSpace)))
{
    takeProperties(instance);
}

InstanceObject::InstanceObject(const InstanceObject& other)
    : CMPIInstance{nullptr, &kInstanceTable}, broker(other.broker), fPath(other.fPath), fValues(other.fValues),
      fLastSet(other.fLastSet), fPathKeys(other.fPathKeys), fExtra(other.fExtra)
{
    hdl = this;
}

InstanceObject::~InstanceObject()
{
    Frame::leaveValues(std::move(fValues));
}

// A path's keys may be wider than the class declares; a key that the class lacks stays in the path alone.
void InstanceObject::takeKeys()
{
    for (const PathKey& key : fPath.keys) {
        const std::size_t at = fPath.schema ? fPath.schema->findKey(key.name) : ClassSchema::kNotFound;
        if (at != ClassSchema::kNotFound) {
            const CIMType type = fPath.schema->properties()[at].type;
            fValues[at] = key.value.type() == type ? key.value : ProviderValue(convertKey(key.value.value(), type));
            fPathKeys |= keyBit(*fPath.schema, at);
        } else if (fPath.schema == nullptr) {
            storeExtra(key.name, key.value.value());
        }
    }
}

void InstanceObject::takeProperties(const CIMInstance& instance)
{
    for (Uint32 i = 0; i < instance.getPropertyCount(); ++i) {
        const CIMConstProperty property = instance.getProperty(i);
        if (fPath.schema == nullptr) {
            storeExtra(property.getName(), property.getValue());
            continue;
        }
        const std::size_t at = fPath.schema->find(base::utf8(property.getName()));
        if (at != ClassSchema::kNotFound && accepts(fPath.schema->properties()[at], property.getValue())) {
            fValues[at] = ProviderValue(property.getValue());
        }
    }
    fPathKeys = 0; // an instance of the server's
}

void InstanceObject::storeExtra(const CIMName& name, CIMValue value)
{
    for (NamedValue& held : fExtra) {
        if (held.name.equal(name)) {
            held.value = std::move(value);
            return;
        }
    }
    fExtra.push_back({name, std::move(value)});
}

CIMValue InstanceObject::valueAt(std::size_t index) const
{
    return fValues[index].isSet() ? fValues[index].value() : fPath.schema->properties()[index].initial;
}

CMPICount InstanceObject::propertyCount() const
{
    return static_cast<CMPICount>(fPath.schema ? fValues.size() : fExtra.size());
}

// An empty array reads as null, as it does on OpenPegasus; clients get it as it is.
CMPIData InstanceObject::encode(std::size_t index) const
{
    const CIMValue value = fPath.schema ? valueAt(index) : fExtra[index].value;
    const bool isEmpty = value.isArray() && !value.isNull() && value.getArraySize() == 0;
    return encodeValue(broker, isEmpty ? CIMValue(value.getType(), true) : value);
}

CMPIData InstanceObject::property(const char* name) const
{
    requireText(name);
    if (fPath.schema != nullptr) {
        const std::size_t at = fPath.schema->find(name);
        if (at != ClassSchema::kNotFound) {
            return encode(at);
        }
    }
    for (std::size_t i = 0; i < fExtra.size(); ++i) {
        if (base::equalNoCase(base::utf8(fExtra[i].name), name)) {
            return encode(i);
        }
    }
    throw CmpiError{CMPI_RC_ERR_NO_SUCH_PROPERTY, {}};
}

CMPIData InstanceObject::propertyAt(CMPICount index, CMPIString** name) const
{
    if (index >= propertyCount()) {
        throw CmpiError{CMPI_RC_ERR_NO_SUCH_PROPERTY, {}};
    }
    if (name != nullptr) {
        *name = makeName(fPath.schema ? fPath.schema->properties()[index].name : fExtra[index].name);
    }
    return encode(index);
}

void InstanceObject::setProperty(const char* name, const CMPIValue* value, CMPIType type)
{
    requireText(name);
    if (fPath.schema == nullptr) {
        storeExtra(requireName(name), decodeValue(value, type));
        return;
    }
    const std::size_t at = fPath.schema->findAfter(fLastSet, name);
    if (at == ClassSchema::kNotFound) {
        broker.warnOnce("setProperty: class " + fPath.schema->text() + " has no property " + name);
        return;
    }
    fLastSet = at;
    const PropertySchema& declared = fPath.schema->properties()[at];
    const bool mayBeTaken = value != nullptr && !declared.start.empty();
    if (!mayBeTaken || !fValues[at].take(value, type, declared.type)) {
        store(at, value, type);
    }
    if (declared.isKey) {
        fPathKeys &= ~keyBit(*fPath.schema, at);
    }
}

// A value of any form.
void InstanceObject::store(std::size_t index, const CMPIValue* value, CMPIType type)
{
    const PropertySchema& declared = fPath.schema->properties()[index];
    if (type == CMPI_null) {
        tolerate(Habit::kUntypedNull);
    } else if (declared.embedded != EmbeddedKind::kNone && value != nullptr && cimTypeOf(type) == CIMTYPE_STRING) {
        tolerate(Habit::kEmbeddedAsText);
    } else if (type == (CMPI_instance | CMPI_ARRAY) && value != nullptr) {
        tolerate(Habit::kEmbeddedArray);
    }
    CIMValue decoded = type == CMPI_null ? CIMValue(declared.type, declared.isArray) : decodeValue(value, type);
    if (!accepts(declared, decoded)) {
        const std::string text = "property " + declared.text + " of " + fPath.schema->text() + " has another type";
        broker.warnOnce("setProperty: " + text); // many a provider ignores the status
        throw CmpiError{CMPI_RC_ERR_INVALID_DATA_TYPE, text};
    }
    fValues[index] = ProviderValue(std::move(decoded));
}

// Most providers set keys as properties only; the path that goes to the client needs them all.
PathState InstanceObject::completePath() const
{
    PathState path = fPath;
    if (path.schema == nullptr) {
        return path;
    }
    for (const std::size_t key : path.schema->keys()) {
        const ProviderValue value = fValues[key].isSet() ? fValues[key] : ProviderValue(valueAt(key));
        const CIMName& name = path.schema->properties()[key].name;
        if (!value.isNull() && path.findKey(name) == nullptr) {
            path.keys.push_back({name, value});
        }
    }
    return path;
}

void InstanceObject::setPath(const PathState& path)
{
    if (!path.className.equal(fPath.className)) {
        throw CmpiError{CMPI_RC_ERR_FAILED, "Incompatible ObjectPath"};
    }
    fPath.nameSpace = path.nameSpace;
    fPath.host = path.host;
    fPath.keys = path.keys;
    takeKeys();
}

std::vector<const NamedValue*> InstanceObject::undeclared(const PropertyFilter& filter) const
{
    std::vector<const NamedValue*> result;
    if (filter.passesAll()) {
        for (auto extra = fExtra.rbegin(); extra != fExtra.rend(); ++extra) {
            result.push_back(&*extra);
        }
    } else if (!fExtra.empty()) {
        broker.warnOnce("class " + base::utf8(fPath.className) + " is not declared in namespace " +
                        base::utf8(fPath.nameSpace.getString()) +
                        ": a list of properties leaves its instances without any");
    }
    return result;
}

CIMInstance InstanceObject::filtered(const PropertyFilter& filter) const
{
    CIMInstance result(fPath.className);
    // Appends directly and skips addProperty()'s search for the same name: the schema's names are distinct.
    Array<CIMProperty>& properties = ObjectAccess::rep(result).fProperties;
    properties.reserveCapacity(static_cast<Uint32>(propertyCount()));
    if (fPath.schema != nullptr) {
        const auto& declared = fPath.schema->properties();
        for (const std::size_t i : filter.passing(*fPath.schema)) {
            properties.append(propertyOf(declared[i], valueAt(i)));
        }
    }
    for (const NamedValue* extra : undeclared(filter)) {
        properties.append(CIMProperty(extra->name, extra->value));
    }
    return result;
}

CIMObjectPath InstanceObject::deliveredPath() const
{
    if (fPathKeys != 0) {
        tolerate(Habit::kKeysOnPathOnly);
    }
    return completePath().delivered();
}

CIMInstance InstanceObject::delivered(const PropertyFilter& filter) const
{
    CIMInstance result = filtered(filter);
    result.setPath(deliveredPath());
    return result;
}

CIMInstance InstanceObject::value() const
{
    CIMInstance result = filtered(PropertyFilter());
    result.setPath(completePath().withoutNameSpace());
    return result;
}

} // namespace Pegasus::cmpi
