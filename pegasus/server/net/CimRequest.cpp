#include "pegasus/server/net/CimRequest.h"

#include "pegasus/base/AsciiCase.h"

namespace Pegasus::server {

using wire::XmlElement;
using wire::XmlError;

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

CIMClass IntrinsicParameters::cimClass(std::string_view parameter) const
{
    return fDecoder->decodeClass(require(parameter, "CLASS"));
}

CIMQualifierDecl IntrinsicParameters::qualifierDeclaration(std::string_view parameter) const
{
    return fDecoder->decodeQualifierDeclaration(require(parameter, "QUALIFIER.DECLARATION"));
}

} // namespace Pegasus::server
