// SPDX-License-Identifier: MIT
#include "pegasus/repository/ObjectCodec.h"

#include "pegasus/base/Text.h"
#include "pegasus/repository/CimError.h"
#include "pegasus/wire/ElementEncoder.h"

namespace Pegasus::repository {

namespace {

// An accepted object must stay readable, whatever limits the network has.
wire::XmlLimits storageLimits(std::size_t maxBytes)
{
    wire::XmlLimits limits;
    limits.maxTextBytes = maxBytes;
    limits.maxElementBytes = maxBytes;
    limits.maxElements = maxBytes;
    limits.maxArrayElements = maxBytes;
    return limits;
}

} // namespace

std::string ObjectEncoder::checked(std::string text) const
{
    if (text.size() > fMaxBytes) {
        fail(CIM_ERR_SERVER_LIMITS_EXCEEDED,
             "object is larger than the limit objectBytes (" + std::to_string(fMaxBytes) + ")");
    }
    return text;
}

std::string ObjectEncoder::encodeClass(const CIMConstClass& object) const
{
    std::string text;
    wire::appendClass(text, object);
    return checked(std::move(text));
}

std::string ObjectEncoder::encodeInstance(const CIMConstInstance& object) const
{
    std::string text;
    wire::appendInstance(text, object);
    return checked(std::move(text));
}

std::string ObjectEncoder::encodeQualifier(const CIMConstQualifierDecl& object) const
{
    std::string text;
    wire::appendQualifierDeclaration(text, object);
    return checked(std::move(text));
}

ObjectDecoder::ObjectDecoder(const ObjectEncoder& encoder)
    : fDocument(storageLimits(encoder.maxBytes())), fDecoder(storageLimits(encoder.maxBytes()))
{
}

template <typename Object>
Object ObjectDecoder::decode(std::string& text, Object (wire::ElementDecoder::*function)(const wire::XmlElement&))
{
    try {
        return (fDecoder.*function)(fDocument.parseFragment(text));
    } catch (const wire::XmlError& error) {
        fail(CIM_ERR_FAILED, "cannot read the repository: " + base::utf8(error.getMessage()));
    }
}

CIMClass ObjectDecoder::decodeClass(std::string text)
{
    return decode<CIMClass>(text, &wire::ElementDecoder::decodeClass);
}

CIMInstance ObjectDecoder::decodeInstance(std::string text)
{
    return decode<CIMInstance>(text, &wire::ElementDecoder::decodeInstance);
}

CIMQualifierDecl ObjectDecoder::decodeQualifier(std::string text)
{
    return decode<CIMQualifierDecl>(text, &wire::ElementDecoder::decodeQualifierDeclaration);
}

} // namespace Pegasus::repository
