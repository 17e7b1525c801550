// SPDX-License-Identifier: MIT
#include "pegasus/server/net/CimRequest.h"

#include "pegasus/base/AsciiCase.h"
#include "pegasus/server/admin/Log.h"

#include <algorithm>

namespace Pegasus::server {

using wire::XmlElement;
using wire::XmlError;

namespace {

// Calls visit(word) for each word of a list until it returns true. Returns: whether one did.
template <typename Visit> bool anyWord(std::string_view list, const Visit& visit)
{
    while (!list.empty()) {
        const std::size_t end = std::min(list.find(' '), list.size());
        if (visit(list.substr(0, end))) {
            return true;
        }
        list.remove_prefix(std::min(end + 1, list.size()));
    }
    return false;
}

bool hasWord(std::string_view list, std::string_view wanted)
{
    return anyWord(list, [&](std::string_view word) { return base::equalNoCase(word, wanted); });
}

[[noreturn]] void refuse(CIMStatusCode code, std::string_view parameter, const char* why)
{
    Log::write(LogLevel::kInformation, "request refused: parameter " + std::string(parameter) + " " + why);
    throw CIMException(code, String());
}

} // namespace

void IntrinsicParameters::add(std::string_view name, XmlElement value)
{
    fParameters.push_back({name, value});
}

XmlElement IntrinsicParameters::find(std::string_view parameter) const
{
    for (const Parameter& candidate : fParameters) {
        if (base::equalNoCase(candidate.name, parameter)) {
            return candidate.value;
        }
    }
    return {};
}

void IntrinsicParameters::check(std::string_view required, std::string_view optional) const
{
    for (const Parameter& sent : fParameters) {
        if (!hasWord(required, sent.name) && !hasWord(optional, sent.name)) {
            refuse(CIM_ERR_NOT_SUPPORTED, sent.name, "is unknown");
        }
    }
    for (auto sent = fParameters.begin(); sent != fParameters.end(); ++sent) {
        if (std::any_of(fParameters.begin(), sent,
                        [&](const Parameter& before) { return base::equalNoCase(before.name, sent->name); }))
        {
            refuse(CIM_ERR_INVALID_PARAMETER, sent->name, "was sent twice");
        }
    }
    anyWord(required, [&](std::string_view name) {
        if (!find(name)) {
            refuse(CIM_ERR_INVALID_PARAMETER, name, "is missing");
        }
        return false;
    });
}

XmlElement IntrinsicParameters::require(std::string_view parameter, const char* element) const
{
    const XmlElement value = find(parameter);
    if (!value) {
        fCall.fail(XmlError::Kind::kInvalid, std::string("expected ") + element + " element");
    }
    value.expectName(element);
    return value;
}

CIMName IntrinsicParameters::className(std::string_view parameter) const
{
    return fDecoder->decodeClassName(require(parameter, "CLASSNAME"));
}

CIMName IntrinsicParameters::optionalClassName(std::string_view parameter) const
{
    const XmlElement value = find(parameter);
    return value ? fDecoder->decodeClassName(value) : CIMName();
}

CIMName IntrinsicParameters::name(std::string_view parameter) const
{
    const XmlElement value = require(parameter, "VALUE");
    String text;
    fDecoder->decodeValue(value, CIMTYPE_STRING).get(text);
    if (!CIMName::legal(text)) {
        value.fail(XmlError::Kind::kSemantic, "Illegal value for " + std::string(parameter));
    }
    return CIMName(text);
}

bool IntrinsicParameters::boolean(std::string_view parameter, bool defaultValue) const
{
    const XmlElement value = find(parameter);
    Boolean flag = defaultValue;
    if (value) {
        value.expectName("VALUE");
        fDecoder->decodeValue(value, CIMTYPE_BOOLEAN).get(flag);
    }
    return flag;
}

CIMPropertyList IntrinsicParameters::propertyList() const
{
    const XmlElement value = find("PropertyList");
    if (!value) {
        return CIMPropertyList();
    }
    value.expectName("VALUE.ARRAY");
    Array<String> texts;
    fDecoder->decodeValue(value, CIMTYPE_STRING).get(texts);
    Array<CIMName> names;
    for (Uint32 i = 0; i < texts.size(); ++i) {
        if (!CIMName::legal(texts[i])) {
            value.fail(XmlError::Kind::kSemantic, "Illegal value for PropertyList");
        }
        names.append(CIMName(texts[i]));
    }
    return CIMPropertyList(names);
}

CIMObjectPath IntrinsicParameters::instanceName(std::string_view parameter) const
{
    return fDecoder->decodeInstanceName(require(parameter, "INSTANCENAME"));
}

CIMInstance IntrinsicParameters::instance(std::string_view parameter) const
{
    return fDecoder->decodeInstance(require(parameter, "INSTANCE"));
}

CIMInstance IntrinsicParameters::namedInstance(std::string_view parameter) const
{
    return fDecoder->decodeNamedInstance(require(parameter, "VALUE.NAMEDINSTANCE"));
}

CIMValue IntrinsicParameters::value(std::string_view parameter, CIMType type, bool isArray) const
{
    const XmlElement sent = find(parameter);
    if (!sent) {
        return CIMValue(type, isArray);
    }
    const bool isReference = sent.is("VALUE.REFERENCE") || sent.is("VALUE.REFARRAY");
    const bool hasMany = sent.is("VALUE.ARRAY") || sent.is("VALUE.REFARRAY");
    if (hasMany != isArray || isReference != (type == CIMTYPE_REFERENCE)) {
        throw CIMException(CIM_ERR_TYPE_MISMATCH, String());
    }
    try {
        return fDecoder->decodeValue(sent, type);
    } catch (const XmlError& error) { // the text does not convert
        throw CIMException(CIM_ERR_INVALID_PARAMETER, error.getMessage());
    }
}

CIMClass IntrinsicParameters::cimClass(std::string_view parameter) const
{
    return fDecoder->decodeClass(require(parameter, "CLASS"));
}

CIMQualifierDecl IntrinsicParameters::qualifierDeclaration(std::string_view parameter) const
{
    return fDecoder->decodeQualifierDeclaration(require(parameter, "QUALIFIER.DECLARATION"));
}

} // namespace Pegasus::server
