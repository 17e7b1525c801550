#include "pegasus/repository/ObjectText.h"

#include "pegasus/repository/Failure.h"
#include "pegasus/wire/ElementEncoder.h"

namespace Pegasus::repository {

namespace {

// What was accepted once must be readable later, whatever limits the network has.
wire::XmlLimits storageLimits(std::size_t maxBytes)
{
    wire::XmlLimits limits;
    limits.maxTextBytes = maxBytes;
    limits.maxElementBytes = maxBytes;
    limits.maxArrayElements = maxBytes;
    return limits;
}

} // namespace

ObjectText::ObjectText(std::size_t maxBytes)
    : fMaxBytes(maxBytes), fDocument(storageLimits(maxBytes)), fDecoder(storageLimits(maxBytes))
{
}

std::string ObjectText::checked(std::string text) const
{
    if (text.size() > fMaxBytes) {
        fail(CIM_ERR_SERVER_LIMITS_EXCEEDED,
             "object is larger than the limit objectBytes (" + std::to_string(fMaxBytes) + ")");
    }
    return text;
}

std::string ObjectText::fromClass(const CIMConstClass& object) const
{
    std::string text;
    wire::appendClass(text, object);
    return checked(std::move(text));
}

std::string ObjectText::fromInstance(const CIMConstInstance& object) const
{
    std::string text;
    wire::appendInstance(text, object);
    return checked(std::move(text));
}

std::string ObjectText::fromQualifier(const CIMConstQualifierDecl& object) const
{
    std::string text;
    wire::appendQualifierDeclaration(text, object);
    return checked(std::move(text));
}

template <class Object>
Object ObjectText::decode(std::string& text, Object (wire::ElementDecoder::*function)(const wire::XmlElement&))
{
    try {
        return (fDecoder.*function)(fDocument.parseElement(text.data(), text.size(), {}));
    } catch (const wire::XmlError& error) {
        fail(CIM_ERR_FAILED, "cannot read the repository: " + utf8(error.getMessage()));
    }
}

CIMClass ObjectText::toClass(std::string text)
{
    return decode<CIMClass>(text, &wire::ElementDecoder::decodeClass);
}

CIMInstance ObjectText::toInstance(std::string text)
{
    return decode<CIMInstance>(text, &wire::ElementDecoder::decodeInstance);
}

CIMQualifierDecl ObjectText::toQualifier(std::string text)
{
    return decode<CIMQualifierDecl>(text, &wire::ElementDecoder::decodeQualifierDeclaration);
}

} // namespace Pegasus::repository
