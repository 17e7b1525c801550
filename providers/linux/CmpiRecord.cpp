// SPDX-License-Identifier: MIT
#include "providers/linux/CmpiRecord.h"

#include <type_traits>

#include <strings.h>

namespace lnx {
namespace {

template <typename T> constexpr CMPIType typeOf();
template <> constexpr CMPIType typeOf<bool>()
{
    return CMPI_boolean;
}
template <> constexpr CMPIType typeOf<std::uint8_t>()
{
    return CMPI_uint8;
}
template <> constexpr CMPIType typeOf<std::int8_t>()
{
    return CMPI_sint8;
}
template <> constexpr CMPIType typeOf<std::uint16_t>()
{
    return CMPI_uint16;
}
template <> constexpr CMPIType typeOf<std::int16_t>()
{
    return CMPI_sint16;
}
template <> constexpr CMPIType typeOf<std::uint32_t>()
{
    return CMPI_uint32;
}
template <> constexpr CMPIType typeOf<std::int32_t>()
{
    return CMPI_sint32;
}
template <> constexpr CMPIType typeOf<std::uint64_t>()
{
    return CMPI_uint64;
}
template <> constexpr CMPIType typeOf<std::int64_t>()
{
    return CMPI_sint64;
}
template <> constexpr CMPIType typeOf<float>()
{
    return CMPI_real32;
}
template <> constexpr CMPIType typeOf<double>()
{
    return CMPI_real64;
}
template <> constexpr CMPIType typeOf<Char16>()
{
    return CMPI_char16;
}
template <> constexpr CMPIType typeOf<std::string>()
{
    return CMPI_chars;
}

// What a broker's function wants to see of a value: the text itself, or a pointer to as many bytes as the type has.
template <typename T> const CMPIValue* pointerTo(const T& value)
{
    if constexpr (std::is_same_v<T, std::string>) {
        return reinterpret_cast<const CMPIValue*>(value.c_str());
    } else {
        return reinterpret_cast<const CMPIValue*>(&value);
    }
}

template <typename Object> void release(Object* object)
{
    if (object != nullptr) {
        object->ft->release(object);
    }
}

// Calls `use(value, type)` with the value as the broker takes it; returns the broker's status.
class ValuePasser
{
  public:
    explicit ValuePasser(const CMPIBroker& broker) : fBroker(broker) {}

    template <typename T, typename Use> CMPIStatus pass(const T& value, Use&& use) const
    {
        return use(pointerTo(value), typeOf<T>());
    }

    template <typename Use> CMPIStatus pass(const DateTime& value, Use&& use) const
    {
        CMPIStatus status{CMPI_RC_OK, nullptr};
        CMPIDateTime* made =
            fBroker.eft->newDateTimeFromBinary(&fBroker, value.microseconds, value.isInterval, &status);
        return usedOnce(made, status, CMPI_dateTime, use);
    }

    // Text goes into an array of CMPI_chars, which copies it. An array of CMPI_string keeps the handles of its elements
    // in some brokers: a string object must then outlive the array's last use.
    template <typename T, typename Use> CMPIStatus pass(const std::vector<T>& values, Use&& use) const
    {
        constexpr CMPIType kElement = typeOf<T>();
        CMPIStatus status{CMPI_RC_OK, nullptr};
        CMPIArray* array = fBroker.eft->newArray(&fBroker, static_cast<CMPICount>(values.size()), kElement, &status);
        for (CMPICount i = 0; array != nullptr && status.rc == CMPI_RC_OK && i < values.size(); ++i) {
            status = array->ft->setElementAt(array, i, pointerTo(values[i]), kElement);
        }
        return usedOnce(array, status, static_cast<CMPIType>(CMPI_ARRAY | kElement), use);
    }

    // Releases the object after its one use: the broker has copied it by then.
    template <typename Object, typename Use>
    static CMPIStatus usedOnce(Object* object, CMPIStatus status, CMPIType type, Use&& use)
    {
        if (object != nullptr && status.rc == CMPI_RC_OK) {
            status = use(reinterpret_cast<const CMPIValue*>(&object), type);
        }
        release(object);
        return status;
    }

  private:
    const CMPIBroker& fBroker;
};

bool sameKey(const CMPIObjectPath& path, const std::string& name, const std::string& expected)
{
    const CMPIData data = path.ft->getKey(&path, name.c_str(), nullptr);
    return (data.state & CMPI_nullValue) == 0 && data.type == CMPI_string && textOf(data.value.string) == expected;
}

bool sameKey(const CMPIObjectPath& path, const std::string& name, const Reference& expected)
{
    const CMPIData data = path.ft->getKey(&path, name.c_str(), nullptr);
    if ((data.state & CMPI_nullValue) != 0 || data.type != CMPI_ref || data.value.ref == nullptr) {
        return false;
    }
    const std::string className = textOf(data.value.ref->ft->getClassName(data.value.ref, nullptr));
    if (::strcasecmp(className.c_str(), expected.className.c_str()) != 0) {
        return false;
    }
    for (const auto& [key, value] : expected.keys) {
        if (!sameKey(*data.value.ref, key, value)) {
            return false;
        }
    }
    return true;
}

} // namespace

std::string textOf(const CMPIString* string)
{
    const char* text = string != nullptr ? string->ft->getCharPtr(string, nullptr) : nullptr;
    return text != nullptr ? text : std::string();
}

CMPIObjectPath* CmpiRecord::reference(const Reference& reference, CMPIStatus& status) const
{
    CMPIObjectPath* path =
        fBroker.eft->newObjectPath(&fBroker, fNameSpace.c_str(), reference.className.c_str(), &status);
    for (const auto& [name, value] : reference.keys) {
        if (path != nullptr && status.rc == CMPI_RC_OK) {
            status = path->ft->addKey(path, name.c_str(), pointerTo(value), CMPI_chars);
        }
    }
    return path;
}

void CmpiRecord::addKey(CMPIObjectPath& path, const Property& property, CMPIStatus& status) const
{
    const auto add = [&](const CMPIValue* value, CMPIType type) {
        return path.ft->addKey(&path, property.name.c_str(), value, type);
    };
    if (const auto* linked = std::get_if<Reference>(&property.value)) {
        CMPIStatus made{CMPI_RC_OK, nullptr};
        CMPIObjectPath* target = reference(*linked, made);
        status = ValuePasser::usedOnce(target, made, CMPI_ref, add);
    } else if (const auto* text = std::get_if<std::string>(&property.value)) {
        status = add(pointerTo(*text), CMPI_chars);
    }
}

CMPIObjectPath* CmpiRecord::path(const Record& record, CMPIStatus& status) const
{
    status = {CMPI_RC_OK, nullptr};
    CMPIObjectPath* path =
        fBroker.eft->newObjectPath(&fBroker, fNameSpace.c_str(), record.className().c_str(), &status);
    for (const Property& property : record.properties()) {
        if (path != nullptr && status.rc == CMPI_RC_OK && property.isKey) {
            addKey(*path, property, status);
        }
    }
    if (status.rc != CMPI_RC_OK) {
        release(path);
        return nullptr;
    }
    return path;
}

CMPIStatus CmpiRecord::setProperty(CMPIInstance& instance, const Property& property) const
{
    const auto set = [&](const CMPIValue* value, CMPIType type) {
        return instance.ft->setProperty(&instance, property.name.c_str(), value, type);
    };
    if (const auto* linked = std::get_if<Reference>(&property.value)) {
        CMPIStatus made{CMPI_RC_OK, nullptr};
        CMPIObjectPath* target = reference(*linked, made);
        return ValuePasser::usedOnce(target, made, CMPI_ref, set);
    }
    const ValuePasser passer(fBroker);
    return std::visit(
        [&](const auto& value) {
            if constexpr (std::is_same_v<std::decay_t<decltype(value)>, Reference>) {
                return CMPIStatus{CMPI_RC_OK, nullptr}; // done above
            } else {
                return passer.pass(value, set);
            }
        },
        property.value);
}

CMPIInstance* CmpiRecord::instance(const Record& record, CMPIStatus& status) const
{
    CMPIObjectPath* at = path(record, status);
    if (at == nullptr) {
        return nullptr;
    }
    CMPIInstance* instance = fBroker.eft->newInstance(&fBroker, at, &status);
    release(at);
    for (const Property& property : record.properties()) {
        if (instance != nullptr && status.rc == CMPI_RC_OK) {
            status = setProperty(*instance, property);
        }
    }
    if (status.rc != CMPI_RC_OK) {
        release(instance);
        return nullptr;
    }
    return instance;
}

bool CmpiRecord::matches(const Record& record, const CMPIObjectPath& path)
{
    for (const Property& property : record.properties()) {
        if (!property.isKey) {
            continue;
        }
        const auto* linked = std::get_if<Reference>(&property.value);
        const bool isSame = linked != nullptr ? sameKey(path, property.name, *linked)
                                              : sameKey(path, property.name, std::get<std::string>(property.value));
        if (!isSame) {
            return false;
        }
    }
    return true;
}

} // namespace lnx
