// SPDX-License-Identifier: MIT
#include "pegasus/cmpi/objects/PathState.h"

#include "pegasus/base/AsciiCase.h"
#include "pegasus/base/Text.h"
#include "pegasus/cmpi/objects/Broker.h"
#include "pegasus/cmpi/objects/KeyCodec.h"
#include "pegasus/cmpi/objects/TableFunction.h"
#include "pegasus/cmpi/objects/ValueCodec.h"
#include "pegasus/common/CIMObjectPathRep.h"

#include <Pegasus/Common/Exception.h>

#include <algorithm>
#include <charconv>
#include <string>

namespace Pegasus::cmpi {
namespace {

CIMNamespaceName nameSpaceOf(const char* text)
{
    if (text == nullptr || *text == '\0') {
        return {};
    }
    try {
        return {base::fromUtf8Repaired(text)};
    } catch (const Exception& error) {
        throw CmpiError{CMPI_RC_ERR_INVALID_PARAMETER, base::utf8(error.getMessage())};
    }
}

CIMName classOf(const char* text)
{
    return text == nullptr || *text == '\0' ? CIMName() : requireName(text);
}

template <typename Number> bool parse(const std::string& text, std::size_t start, int radix, Number& number)
{
    const char* const end = text.data() + text.size();
    const auto [stop, error] = std::from_chars(text.data() + start, end, number, radix);
    return error == std::errc() && stop == end;
}

// The wire passes any text as a numeric key; other texts than numbers stay text.
CIMValue numberOf(const String& text)
{
    const std::string digits = base::utf8(text);
    const bool isHex = base::startsWithNoCase(digits, "0x");
    Sint64 negative = 0;
    if (!digits.empty() && digits[0] == '-' && parse(digits, 0, 10, negative)) {
        return CIMValue(negative);
    }
    Uint64 positive = 0;
    if (parse(digits, isHex ? 2 : 0, isHex ? 16 : 10, positive)) {
        return CIMValue(positive);
    }
    Real64 real = 0;
    const char* const end = digits.data() + digits.size();
    const auto [stop, error] = std::from_chars(digits.data(), end, real);
    return error == std::errc() && stop == end ? CIMValue(real) : CIMValue(text);
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

// The binding with the type that the class declares. Where the class is unknown or the conversion fails, the value
// keeps the type of its text: the provider decides.
CIMValue typedKey(const ClassSchema* schema, const CIMKeyBinding& binding)
{
    CIMValue value = valueOfBinding(binding);
    const std::size_t at = schema ? schema->find(base::utf8(binding.getName())) : ClassSchema::kNotFound;
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

// A 64-bit integer may stand for any integer of its sign: that is how a provider gets keys.
bool isSameKeyKind(CIMType declared, CIMType given)
{
    return declared == given || (given == CIMTYPE_UINT64 && isInteger(declared)) ||
           (given == CIMTYPE_SINT64 && isInteger(declared));
}

CIMKeyBinding missingKey(const PropertySchema& declared)
{
    const CIMKeyBinding::Type type = declared.type == CIMTYPE_BOOLEAN ? CIMKeyBinding::BOOLEAN
                                     : isInteger(declared.type)       ? CIMKeyBinding::NUMERIC
                                                                      : CIMKeyBinding::STRING;
    return {declared.name, String(), type};
}

} // namespace

PathState::PathState(Broker& broker, const char* ns, const char* cls)
{
    Frame& frame = Frame::current();
    NamedClass& last = frame.lastClass();
    const bool isNamed = ns != nullptr && cls != nullptr;
    if (isNamed && last.schema != nullptr && last.schema->text() == cls && last.nameSpaceText == ns) {
        schema = last.schema;
        nameSpace = last.nameSpace;
        className = schema->name();
        return;
    }
    schema = isNamed ? broker.classes().find(ns, cls) : nullptr;
    nameSpace = nameSpaceOf(ns);
    className = schema != nullptr ? schema->name() : classOf(cls);
    if (schema != nullptr && frame.origin().broker == &broker) {
        last = {ns, nameSpace, schema};
    }
}

PathState::PathState(Broker& broker, const CIMObjectPath& path)
    : nameSpace(path.getNameSpace()), host(path.getHost()), className(path.getClassName())
{
    lookUp(broker);
    const Array<CIMKeyBinding>& bindings = path.getKeyBindings();
    keys.reserve(bindings.size());
    for (Uint32 i = 0; i < bindings.size(); ++i) {
        keys.push_back({bindings[i].getName(), ProviderValue(typedKey(schema, bindings[i]))});
    }
}

void PathState::lookUp(Broker& broker)
{
    const bool isNamed = !className.isNull() && !nameSpace.isNull();
    schema = isNamed ? broker.classes().find(base::utf8(nameSpace.getString()), base::utf8(className)) : nullptr;
}

// Returns: the name as the class spells it.
CIMName PathState::keyNameOf(const char* name, CMPIType type) const
{
    const std::size_t at = schema != nullptr ? schema->find(requireText(name)) : ClassSchema::kNotFound;
    if (at == ClassSchema::kNotFound || !schema->properties()[at].isKey) {
        CIMName other = requireName(name);
        if (Broker* broker = Frame::current().origin().broker; schema != nullptr && broker != nullptr) {
            broker->warnOnce("addKey: " + std::string(name) + " is not a key of class " + schema->text());
        }
        return at == ClassSchema::kNotFound ? other : schema->properties()[at].name;
    }
    const PropertySchema& declared = schema->properties()[at];
    if (!isSameKeyKind(declared.type, cimTypeOf(type))) {
        const std::string text = "key " + declared.text + " of " + schema->text() + " has another type";
        if (Broker* broker = Frame::current().origin().broker) {
            broker->warnOnce("addKey: " + text); // many a provider ignores the status
        }
        throw CmpiError{CMPI_RC_ERR_INVALID_DATA_TYPE, text};
    }
    return declared.name;
}

void PathState::addKey(const char* name, const CMPIValue* value, CMPIType type)
{
    if (!isKeyType(type)) {
        throw CmpiError{CMPI_RC_ERR_INVALID_DATA_TYPE, {}};
    }
    PathKey key{keyNameOf(name, type), {}};
    if (value == nullptr || !key.value.take(value, type, cimTypeOf(type))) {
        key.value = ProviderValue(decodeValue(value, type));
    }
    if (key.value.isNull()) {
        throw CmpiError{CMPI_RC_ERR_FAILED, "addKey: the value is null"};
    }
    // A path holds a character as text, and a text with this one would cost the client the whole answer.
    if (type == CMPI_char16 && value->char16 == 0) {
        throw CmpiError{CMPI_RC_ERR_FAILED, "addKey: the value is the character 0"};
    }
    const auto held =
        std::find_if(keys.begin(), keys.end(), [&](const PathKey& other) { return other.name.equal(key.name); });
    if (held != keys.end()) {
        keys.erase(held);
    }
    keys.push_back(std::move(key));
}

const PathKey* PathState::findKey(std::string_view name) const
{
    for (const PathKey& key : keys) {
        if (base::equalNoCase(base::utf8(key.name), name)) {
            return &key;
        }
    }
    return nullptr;
}

const PathKey* PathState::findKey(const CIMName& name) const
{
    for (const PathKey& key : keys) {
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

CIMObjectPath PathState::delivered() const
{
    if (schema == nullptr) {
        return withoutNameSpace();
    }
    Array<CIMKeyBinding> result;
    for (const std::size_t key : schema->keys()) {
        const PropertySchema& declared = schema->properties()[key];
        if (const PathKey* held = findKey(declared.name)) {
            result.append(CIMKeyBinding(held->name, held->value.value()));
        } else if (declared.type != CIMTYPE_REFERENCE) { // an empty reference is not CIM-XML
            result.append(missingKey(declared));
        }
    }
    std::vector<const PathKey*> others;
    for (const PathKey& key : keys) {
        if (schema->findKey(key.name) == ClassSchema::kNotFound) {
            others.push_back(&key);
        }
    }
    std::sort(others.begin(), others.end(), [](const PathKey* x, const PathKey* y) {
        return String::compareNoCase(x->name.getString(), y->name.getString()) < 0;
    });
    for (const PathKey* key : others) {
        result.append(CIMKeyBinding(key->name, key->value.value()));
    }
    return PathAccess::inOrder(className, result);
}

Array<CIMKeyBinding> PathState::bindings() const
{
    Array<CIMKeyBinding> result;
    for (const PathKey& key : keys) {
        result.append(CIMKeyBinding(key.name, key.value.value()));
    }
    return result;
}

} // namespace Pegasus::cmpi
