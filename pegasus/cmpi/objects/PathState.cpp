#include "pegasus/cmpi/objects/PathState.h"

#include "pegasus/cmpi/objects/Broker.h"
#include "pegasus/cmpi/objects/KeyCodec.h"
#include "pegasus/cmpi/objects/TableFunction.h"
#include "pegasus/cmpi/services/ProviderText.h"

#include <Pegasus/Common/Exception.h>

#include <algorithm>
#include <cerrno>
#include <cstdlib>

namespace Pegasus::cmpi {
namespace {

CIMNamespaceName nameSpaceOf(const char* text)
{
    if (text == nullptr || *text == '\0') {
        return {};
    }
    try {
        return {fromUtf8(text)};
    } catch (const Exception& error) {
        throw CmpiError{CMPI_RC_ERR_INVALID_PARAMETER, utf8(error.getMessage())};
    }
}

CIMName classOf(const char* text)
{
    return text == nullptr || *text == '\0' ? CIMName() : requireName(text);
}

CIMValue numberOf(const String& text)
{
    const std::string digits = utf8(text);
    const char* const begin = digits.c_str();
    char* end = nullptr;
    errno = 0;
    const bool isHex = digits.find_first_of("xX") != std::string::npos;
    const Uint64 bits = digits[0] == '-' ? static_cast<Uint64>(std::strtoll(begin, &end, 10))
                                         : std::strtoull(begin, &end, isHex ? 16 : 10);
    if (errno == 0 && end != begin && *end == '\0') {
        return digits[0] == '-' ? CIMValue(static_cast<Sint64>(bits)) : CIMValue(bits);
    }
    const double real = std::strtod(begin, &end);
    return end != begin && *end == '\0' ? CIMValue(real) : CIMValue(text);
}

CIMValue valueOfBinding(const CIMKeyBinding& binding)
{
    const String& text = binding.getValue();
    switch (binding.getType()) {
    case CIMKeyBinding::BOOLEAN:
        return CIMValue(Boolean{String::equalNoCase(text, String("TRUE"))});
    case CIMKeyBinding::NUMERIC:
        return numberOf(text);
    case CIMKeyBinding::REFERENCE:
        return CIMValue(CIMObjectPath(text));
    default:
        return CIMValue(text);
    }
}

// The binding with the type that the class declares. Where the class is unknown or the text does not fit, the value
// keeps the type of its text: the provider decides.
CIMValue typedKey(const ClassSchema* schema, const CIMKeyBinding& binding)
{
    CIMValue value = valueOfBinding(binding);
    const std::size_t at = schema ? schema->find(utf8(binding.getName())) : ClassSchema::kNotFound;
    if (at == ClassSchema::kNotFound) {
        return value;
    }
    const CIMValue converted = convertKey(value, schema->properties()[at].type);
    return converted.isNull() ? value : converted;
}

bool isKeyType(CMPIType type)
{
    return (type & CMPI_ARRAY) == 0 && type != CMPI_instance && type != CMPI_null;
}

} // namespace

PathState::PathState(Broker& broker, const char* ns, const char* cls)
{
    schema = ns != nullptr && cls != nullptr ? broker.classes().find(ns, cls) : nullptr;
    nameSpace = nameSpaceOf(ns);
    className = schema != nullptr ? schema->name() : classOf(cls);
}

PathState::PathState(Broker& broker, const CIMObjectPath& path)
    : nameSpace(path.getNameSpace()), host(path.getHost()), className(path.getClassName())
{
    lookUp(broker);
    const Array<CIMKeyBinding>& bindings = path.getKeyBindings();
    keys.reserve(bindings.size());
    for (Uint32 i = 0; i < bindings.size(); ++i) {
        keys.push_back({bindings[i].getName(), typedKey(schema, bindings[i])});
    }
}

void PathState::lookUp(Broker& broker)
{
    const bool isNamed = !className.isNull() && !nameSpace.isNull();
    schema = isNamed ? broker.classes().find(utf8(nameSpace.getString()), utf8(className)) : nullptr;
}

void PathState::addKey(const char* name, const CMPIValue* value, CMPIType type)
{
    if (!isKeyType(type)) {
        throw CmpiError{CMPI_RC_ERR_INVALID_DATA_TYPE, {}};
    }
    CIMName keyName;
    if (schema != nullptr) {
        const std::size_t at = schema->find(requireText(name));
        if (at == ClassSchema::kNotFound || !schema->properties()[at].isKey) {
            throw CmpiError{CMPI_RC_ERR_INVALID_PARAMETER, std::string(name) + " is no key of " + schema->text()};
        }
        keyName = schema->properties()[at].name;
    } else {
        keyName = requireName(name);
    }
    CIMValue decoded = decodeValue(value, type);
    const auto held =
        std::find_if(keys.begin(), keys.end(), [&](const NamedValue& key) { return key.name.equal(keyName); });
    if (held != keys.end()) {
        keys.erase(held);
    }
    if (!decoded.isNull()) {
        keys.push_back({std::move(keyName), std::move(decoded)});
    }
}

const NamedValue* PathState::findKey(std::string_view name) const
{
    for (const NamedValue& key : keys) {
        if (sameName(utf8(key.name), name)) {
            return &key;
        }
    }
    return nullptr;
}

const NamedValue* PathState::findKey(const CIMName& name) const
{
    for (const NamedValue& key : keys) {
        if (key.name.equal(name)) {
            return &key;
        }
    }
    return nullptr;
}

CIMObjectPath PathState::withNameSpace() const
{
    return {host, nameSpace, className, bindings()};
}

CIMObjectPath PathState::withoutNameSpace() const
{
    return {String::EMPTY, CIMNamespaceName(), className, bindings()};
}

Array<CIMKeyBinding> PathState::bindings() const
{
    Array<CIMKeyBinding> result;
    for (const NamedValue& key : keys) {
        result.append(CIMKeyBinding(key.name, key.value));
    }
    return result;
}

} // namespace Pegasus::cmpi
